// What a stream of preview frames keeps between frames, and the layout of its working memory.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "haze_preview.h"
#include "recover/recovery_tables.h"

namespace haze::session {

// Limits of a frame. The 64 x 64 mean needs a half-resolution image of its own size at least, and
// the cached map holds one of 640 x 360.
inline constexpr int kLeastSide = 128;
inline constexpr int kMostWidth = 1280;
inline constexpr int kMostHeight = 720;
inline constexpr int kCacheRowBytes = kMostWidth / 2;

// A view of one stream's state. The exported globals are the one instance that the library has; the
// frame driver works on any.
struct StreamState {
  INPUT_FORMAT format;
  uint8_t* block;         // working memory, null while the stream is closed
  size_t block_bytes;     // what the block is known to hold
  uint8_t* cached_codes;  // rows of kCacheRowBytes
  uint8_t* cached_light;  // B, G, R
  int* parity;            // 0: the next frame is an estimate frame
  recover::KeptTables* tables;
};

// Regions of the working memory for one frame size. In bytes, with q = half_width * half_height:
//
//   0          3 * (W * H / 4)       + q        + 2q       + 3q                 4 * W * H
//   | not used | min_map             | max_map  | mean_map | box_scratch ...    |
struct WorkingMemory {
  int half_width;
  int half_height;
  uint8_t* min_map;
  uint8_t* max_map;
  uint8_t* mean_map;
  int16_t* box_scratch;

  static constexpr size_t bytes(int width, int height) {
    return static_cast<size_t>(width) * static_cast<size_t>(height) * 4;
  }

  WorkingMemory(uint8_t* block, int width, int height)
      : half_width(width / 2), half_height(height / 2) {
    const size_t pixels = static_cast<size_t>(half_width) * static_cast<size_t>(half_height);
    min_map = block + 3 * pixels;
    max_map = min_map + pixels;
    mean_map = max_map + pixels;
    // Even sizes put it at 6 * pixels, so a `short` is aligned as the block is.
    box_scratch = reinterpret_cast<int16_t*>(mean_map + pixels);
  }
};

}  // namespace haze::session
