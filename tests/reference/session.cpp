#include "tests/reference/session.h"

#include <algorithm>
#include <limits>
#include <utility>

#include "tests/reference/box_integer.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/max_min_nv21.h"
#include "tests/reference/transmission.h"

namespace haze::reference {
namespace {

constexpr int kPlanar = 3;

// Two bytes per column sum, low byte first as on every target of the library.
void store_column_sums(const std::vector<int>& sums, uint8_t* scratch) {
  for (size_t i = 0; i < sums.size(); ++i) {
    scratch[2 * i] = static_cast<uint8_t>(sums[i] % 256);
    scratch[2 * i + 1] = static_cast<uint8_t>(sums[i] / 256);
  }
}

}  // namespace

BlockRegions::BlockRegions(int width, int height) {
  map_bytes = static_cast<size_t>((width / 2) * (height / 2));
  min_map = 3 * static_cast<size_t>((width * height) / 4);
  max_map = min_map + map_bytes;
  mean_map = max_map + map_bytes;
  box_scratch = mean_map + map_bytes;
}

int sample_light(const uint8_t* max_map, const uint8_t* mean_map, int half_width, int half_height) {
  const int past_last_sample = (half_width - 1) / 2 * 2 + 2;
  int max_of_max = 0;
  int max_of_mean = 0;
  int position = 0;
  for (int row = 0; row < half_height; row += 2) {
    for (int column = 0; column < half_width; column += 2) {
      max_of_max = std::max<int>(max_of_max, max_map[position + column]);
      max_of_mean = std::max<int>(max_of_mean, mean_map[position + column]);
    }
    position += past_last_sample + half_width;
  }
  return (max_of_max + max_of_mean) / 2;
}

float strength_of_level(int level) {
  const float product = static_cast<float>(level) * 7.0f;
  return product / 117.0f;
}

float inverse_light(int light) {
  if (light == 0) return std::numeric_limits<float>::infinity();
  return 1.0f / static_cast<float>(light);
}

void ReferenceSession::init(int new_format, int width, int height) {
  format = new_format;
  if (open) return;
  // Four bytes per pixel, modulo 2^32; from 2^31 on it is more than there is.
  const uint64_t pixels = static_cast<uint64_t>(static_cast<int64_t>(width) * height);
  const uint64_t bytes = pixels % (uint64_t{1} << 30) * 4;
  if (bytes >= uint64_t{1} << 31) return;
  block.assign(static_cast<size_t>(bytes), 0);
  open = true;
  block_is_hosts = false;
}

void ReferenceSession::release() {
  block.clear();
  open = false;
}

void ReferenceSession::adopt_block(std::vector<uint8_t> bytes) {
  block = std::move(bytes);
  open = true;
  block_is_hosts = true;
}

bool ReferenceSession::accepts(int width, int height) const {
  if (!open) return false;
  if (width < 128 || height < 128 || width > 1280 || height > 720) return false;
  if (width % 2 != 0 || height % 2 != 0) return false;
  return block_is_hosts || block.size() >= static_cast<size_t>(width * height * 4);
}

void ReferenceSession::remove_haze(uint8_t* frame, int width, int height, int level) {
  if (!accepts(width, height)) return;
  if (frame_number == 0) {
    frame_number = 1;
    estimate_and_recover(frame, width, height, level);
  } else {
    frame_number = static_cast<int>((static_cast<int64_t>(frame_number) + 1) % 2);
    recover_from_cache(frame, width, height);
  }
}

void ReferenceSession::estimate_and_recover(uint8_t* frame, int width, int height, int level) {
  const int half_width = width / 2;
  const int half_height = height / 2;
  const BlockRegions at(width, height);
  uint8_t* min_map = block.data() + at.min_map;
  uint8_t* max_map = block.data() + at.max_map;
  uint8_t* mean_map = block.data() + at.mean_map;

  max_min_nv21(frame, frame + width * height, min_map, max_map, width, height);
  box_mean(min_map, mean_map, half_width, half_height, kWindow64);
  store_column_sums(box_column_sums_at_end(min_map, half_width, half_height, kWindow64),
                    block.data() + at.box_scratch);

  const int a = sample_light(max_map, mean_map, half_width, half_height);
  light.fill(static_cast<uint8_t>(a));

  transmission_map(mean_map, min_map, max_map, half_width, half_height, strength_of_level(level),
                   inverse_light(a), GroupMinimum::kOwn);
  if (format == kPlanar)
    recover_planar(frame, max_map, light.data(), width, height);
  else
    recover_nv21(frame, max_map, light.data(), width, height);

  for (int row = 0; row < half_height; ++row)
    std::copy_n(max_map + row * half_width, half_width, cache.data() + row * kCacheRowBytes);
}

void ReferenceSession::recover_from_cache(uint8_t* frame, int width, int height) const {
  const int half_width = width / 2;
  const int half_height = height / 2;
  std::vector<uint8_t> codes;
  for (int row = 0; row < half_height; ++row) {
    const uint8_t* cached_row = cache.data() + row * kCacheRowBytes;
    codes.insert(codes.end(), cached_row, cached_row + half_width);
  }
  recover_nv21(frame, codes.data(), light.data(), width, height);
}

}  // namespace haze::reference
