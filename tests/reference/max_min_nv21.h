// Per-sample definition of the half-resolution minimum and maximum colour channels of an NV21
// frame.
#pragma once

#include <cstdint>

namespace haze::reference {

struct MaxMin {
  uint8_t max;
  uint8_t min;
};

// Largest and smallest of B, G and R of one BT.601 sample in 14-bit fixed point.
MaxMin max_min_of_sample(int y, int cr, int cb);

// Both maps are (width / 2) x (height / 2) bytes. Read positions run on from row to row, so that
// odd widths drift.
void max_min_nv21(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out, uint8_t* max_out,
                  int width, int height);

}  // namespace haze::reference
