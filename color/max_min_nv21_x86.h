// Vector path of the half-resolution minimum and maximum channels for x86-64, by vector type.
#pragma once

#include <stdint.h>

#include "color/bt601.h"

namespace haze::color {

// Minimum and maximum of the channel offsets, plus luma, as 16-bit values: for half as many pixels as
// a vector has bytes.
template <typename V>
struct MaxMinStep {
  typename V::Int least;
  typename V::Int most;

  MaxMinStep(const uint8_t* luma, const uint8_t* chroma) {
    using Int = typename V::Int;
    // Chroma less 128 as signed bytes: Cr in the lower half of each 16 bits, Cb in the upper one.
    const Int crcb = V::bit_xor(V::load(chroma), V::set8(kChromaZero));
    const Int cr2 = V::template shift_right16<7>(V::template shift_left16<8>(crcb));
    const Int cb2 = V::template shift_right16<7>(V::bit_and(crcb, V::set16(0xFF00)));
    // Exact: (2c * k + 2^14) >> 15 = (c * k + 2^13) >> 14.
    const Int blue = V::round_high_product16(cb2, V::set16(kBt601BlueFromCb));
    const Int red = V::round_high_product16(cr2, V::set16(kBt601RedFromCr));
    // Two products must be summed before rounding. Chroma is taken times 2^8, as upper bytes, so
    // that everything is shifted by 14 + 8. Range: 2^15 * (11698 + 5636) < 2^30.
    const Int weights = V::set_pairs16(-kBt601GreenFromCr, -kBt601GreenFromCb);
    const Int half = V::set32(kBt601Half << 8);
    const Int green_low = V::template shift_right32<kBt601Bits + 8>(
        V::add32(V::sum_of_products16(V::low_as_high_bytes(crcb), weights), half));
    const Int green_high = V::template shift_right32<kBt601Bits + 8>(
        V::add32(V::sum_of_products16(V::high_as_high_bytes(crcb), weights), half));
    const Int green = V::narrow32(green_low, green_high);
    const Int y = V::bit_and(V::load(luma), V::set16(0x00FF));
    least = V::add16(y, V::min16(blue, V::min16(green, red)));
    most = V::add16(y, V::max16(blue, V::max16(green, red)));
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
