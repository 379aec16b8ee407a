#include "tests/surface/choices.h"

#include <algorithm>

namespace haze::test {

int Choices::between(int first, int last) {
  const uint64_t span = static_cast<uint64_t>(static_cast<int64_t>(last) - first) + 1;
  uint64_t value = 0;
  for (uint64_t reach = 1; reach < span; reach <<= 8) value = value << 8 | byte();
  return static_cast<int>(first + static_cast<int64_t>(value % span));
}

int Choices::slot() {
  const int drawn = between(0, 7);
  return has_lane() ? lane_ % 8 : drawn;
}

Random Choices::random() {
  uint64_t seed = 0;
  for (int i = 0; i < 4; ++i) seed = seed << 8 | byte();
  return Random(seed + static_cast<uint64_t>(lane_ + 1) * 0x9E3779B9u);
}

std::vector<uint8_t> Choices::rest(size_t count) {
  if (has_lane()) return {};
  const size_t taken = std::min(count, static_cast<size_t>(end_ - next_));
  const std::vector<uint8_t> bytes(next_, next_ + taken);
  next_ += taken;
  return bytes;
}

std::vector<uint8_t> draw_choices(Random& random, size_t count) {
  std::vector<uint8_t> bytes(count);
  for (uint8_t& byte : bytes) byte = random.byte();
  return bytes;
}

}  // namespace haze::test
