#include "tests/support/float_planes.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <iomanip>
#include <sstream>
#include <string>

namespace haze::test {
namespace {

constexpr int kMantissa = 1 << 24;

float with_random_sign(Random& random, float value) {
  return random.between(0, 1) == 0 ? value : -value;
}

bool same(float a, float b) {
  return bits_of_float(a) == bits_of_float(b) || (std::isnan(a) && std::isnan(b));
}

std::string dump(const Floats& floats, size_t first, size_t last) {
  std::ostringstream text;
  for (size_t i = first; i < last; ++i)
    text << ' ' << std::setprecision(9) << floats.data[i] << " (" << std::hex
         << bits_of_float(floats.data[i]) << std::dec << ')';
  return text.str();
}

}  // namespace

float make_float(Random& random, FloatMood mood) {
  const int mantissa = random.between(kMantissa / 2, kMantissa - 1);
  switch (mood) {
    case FloatMood::kUnit:
      return std::ldexp(static_cast<float>(random.between(0, kMantissa)), -24);
    case FloatMood::kMixedSigns:
      return std::ldexp(static_cast<float>(random.between(-kMantissa, kMantissa)), -14);
    case FloatMood::kLarge:
      return with_random_sign(
          random, std::ldexp(static_cast<float>(mantissa), random.between(20, 40) - 24));
    case FloatMood::kWideRange:
      return with_random_sign(
          random, std::ldexp(static_cast<float>(mantissa), random.between(-20, 30) - 24));
    case FloatMood::kOffset:
      return 1.0e5f + std::ldexp(static_cast<float>(random.between(0, kMantissa)), -20);
    case FloatMood::kIntegers:
      break;
  }
  return static_cast<float>(random.byte());
}

std::vector<float> make_plane(Random& random, FloatMood mood, int width, int height) {
  std::vector<float> plane(static_cast<size_t>(width) * static_cast<size_t>(height));
  for (float& value : plane) value = make_float(random, mood);
  return plane;
}

float float_between(Random& random, float first, float last) {
  const float fraction = std::ldexp(static_cast<float>(random.between(0, kMantissa)), -24);
  return first + (last - first) * fraction;
}

float float_of_bits(uint32_t bits) {
  float value;
  std::memcpy(&value, &bits, sizeof value);
  return value;
}

uint32_t bits_of_float(float value) {
  uint32_t bits;
  std::memcpy(&bits, &value, sizeof bits);
  return bits;
}

float ulps_from(float value, int steps) {
  return float_of_bits(bits_of_float(value) + static_cast<uint32_t>(steps));
}

::testing::AssertionResult planes_match(const Floats& actual, const Floats& expected,
                                        std::initializer_list<Argument> arguments) {
  const bool same_size = actual.size == expected.size;
  if (same_size && (actual.size == 0 ||
                    std::memcmp(actual.data, expected.data, actual.size * sizeof(float)) == 0))
    return ::testing::AssertionSuccess();

  size_t differing = 0;
  size_t first = 0;
  for (size_t i = 0; same_size && i < actual.size; ++i)
    if (!same(actual.data[i], expected.data[i]) && differing++ == 0) first = i;
  if (same_size && differing == 0) return ::testing::AssertionSuccess();

  size_t row = 0;
  std::ostringstream text;
  text << "seed " << test_seed();
  for (const Argument& argument : arguments) {
    text << ", " << argument.name << " = " << std::setprecision(9) << argument.value;
    if (std::strcmp(argument.name, "row") == 0) row = static_cast<size_t>(argument.value);
  }
  if (!same_size) {
    text << ": " << actual.size << " floats instead of " << expected.size;
    return ::testing::AssertionFailure() << text.str();
  }
  text << ": " << differing << " of " << actual.size << " floats differ, first at " << first;
  if (row != 0) text << " (row " << first / row << ", column " << first % row << ")";
  const size_t from = first < 2 ? 0 : first - 2;
  const size_t to = std::min(first + 3, actual.size);
  text << "\n  floats " << from << " ... " << to - 1 << "\n  actual  " << dump(actual, from, to)
       << "\n  expected" << dump(expected, from, to);
  return ::testing::AssertionFailure() << text.str();
}

::testing::AssertionResult floats_are_untouched(const Floats& actual, uint8_t fill,
                                                std::initializer_list<Argument> arguments) {
  const float unwritten = float_of_bits(fill * 0x01010101u);
  return planes_match(actual, std::vector<float>(actual.size, unwritten), arguments);
}

}  // namespace haze::test
