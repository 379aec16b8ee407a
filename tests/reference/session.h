// The session and its frame driver with state of its own, written from the formulas.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace haze::reference {

// Byte offsets of the maps that a frame of this size keeps in the working block.
struct BlockRegions {
  BlockRegions(int width, int height);

  size_t min_map;
  size_t max_map;
  size_t mean_map;
  size_t box_scratch;
  size_t map_bytes;
};

// Halved sum of the largest sampled bytes of the two maps. Every second row and column is sampled;
// the position runs on from the end of a scanned row, so odd half widths drift to the right and
// past the end of the maps.
int sample_light(const uint8_t* max_map, const uint8_t* mean_map, int half_width, int half_height);

float strength_of_level(int level);
float inverse_light(int light);

class ReferenceSession {
 public:
  static constexpr int kCacheRowBytes = 640;

  // Any sizes.
  void init(int new_format, int width, int height);
  void release();

  // A block that the host supplies: its size is not checked against frames.
  void adopt_block(std::vector<uint8_t> bytes);

  void remove_haze(uint8_t* frame, int width, int height, int level);

  // Whether a frame of this size is processed at all in the present state.
  bool accepts(int width, int height) const;

  int format = 3;
  bool open = false;
  bool block_is_hosts = false;
  std::vector<uint8_t> block;
  std::array<uint8_t, 230400> cache = {};
  std::array<uint8_t, 3> light = {};
  int frame_number = 0;

 private:
  void estimate_and_recover(uint8_t* frame, int width, int height, int level);
  void recover_from_cache(uint8_t* frame, int width, int height) const;
};

}  // namespace haze::reference
