// Vector path of the half-resolution minimum and maximum channels for x86-64, by vector type.
#pragma once

#include <stdint.h>

#include "color/convert_x86.h"

namespace haze::color {

// Minimum and maximum of the colour channels as 16-bit values, not clamped yet: for half as many
// pixels as a vector has bytes.
template <typename V>
struct MaxMinStep {
  typename V::Int least;
  typename V::Int most;

  MaxMinStep(const uint8_t* luma, const uint8_t* chroma) {
    const ChannelOffsetsX86<V> offset(V::bit_xor(V::load(chroma), V::set8(kChromaZero)));
    const typename V::Int y = V::bit_and(V::load(luma), V::set16(0x00FF));
    least = V::add16(y, V::min16(offset.blue, V::min16(offset.green, offset.red)));
    most = V::add16(y, V::max16(offset.blue, V::max16(offset.green, offset.red)));
  }
};

// As max_min_row_portable; returns the first pixel that it did not write.
template <typename V>
int max_min_row_x86(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out, uint8_t* max_out,
                    int end) {
  int x = 0;
  for (; x + V::kBytes <= end; x += V::kBytes) {
    const MaxMinStep<V> low(luma + 2 * x, chroma + 2 * x);
    const MaxMinStep<V> high(luma + 2 * x + V::kBytes, chroma + 2 * x + V::kBytes);
    V::store(min_out + x, V::clamp16(low.least, high.least));
    V::store(max_out + x, V::clamp16(low.most, high.most));
  }
  return x;
}

}  // namespace haze::color
