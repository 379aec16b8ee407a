// A planar 4:2:0 frame, or a stripe of one, with a half-resolution map of float transmissions.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "recover/block_row.h"

namespace haze::recover {

struct PlanarFrame {
  uint8_t* luma;
  uint8_t* u;
  uint8_t* v;
  const float* transmission;
  int width;
  int height;

  int block_columns() const { return width / 2; }
  int block_rows() const { return height / 2; }

  uint8_t* luma_row(int y) const { return luma + static_cast<ptrdiff_t>(y) * width; }
  uint8_t* u_row(int block_y) const {
    return u + static_cast<ptrdiff_t>(block_y) * block_columns();
  }
  uint8_t* v_row(int block_y) const {
    return v + static_cast<ptrdiff_t>(block_y) * block_columns();
  }
  BlockRow row(int block_y) const {
    return {luma_row(2 * block_y), luma_row(2 * block_y + 1), v_row(block_y), u_row(block_y)};
  }
  const float* transmission_row(int block_y) const {
    return transmission + static_cast<ptrdiff_t>(block_y) * block_columns();
  }
  // The row below, or the last one again.
  const float* next_transmission_row(int block_y) const {
    return transmission_row(block_y + 1 < block_rows() ? block_y + 1 : block_y);
  }
};

// A whole packed frame: luma, U and V planes one after the other.
inline PlanarFrame planar_frame(uint8_t* frame, const float* transmission, int width, int height) {
  const ptrdiff_t pixels = static_cast<ptrdiff_t>(width) * height;
  return {frame, frame + pixels, frame + pixels + pixels / 4, transmission, width, height};
}

}  // namespace haze::recover
