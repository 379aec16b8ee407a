// Vector paths of the colour converters for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "color/bt601.h"

namespace haze::color {

// Offsets of the colour channels from luma as 16-bit values. `crcb` holds chroma less 128 as signed
// bytes, Cr in the lower half of each 16 bits and Cb in the upper one.
template <typename V>
struct ChannelOffsetsX86 {
  using Int = typename V::Int;
  Int blue;
  Int green;
  Int red;

  explicit ChannelOffsetsX86(Int crcb) {
    const Int cr2 = V::template shift_right16<7>(V::template shift_left16<8>(crcb));
    const Int cb2 = V::template shift_right16<7>(V::bit_and(crcb, V::set16(0xFF00)));
    // Exact: (2c * k + 2^14) >> 15 = (c * k + 2^13) >> 14.
    blue = V::round_high_product16(cb2, V::set16(kBt601BlueFromCb));
    red = V::round_high_product16(cr2, V::set16(kBt601RedFromCr));
    // Two products must be summed before rounding. Chroma is taken times 2^8, as upper bytes, so
    // that everything is shifted by 14 + 8. Range: 2^15 * (11698 + 5636) < 2^30.
    green =
        V::narrow32(green_sum(V::low_as_high_bytes(crcb)), green_sum(V::high_as_high_bytes(crcb)));
  }

 private:
  static Int green_sum(Int chroma) {
    const Int weights = V::set_pairs16(-kBt601GreenFromCr, -kBt601GreenFromCb);
    return V::template shift_right32<kBt601Bits + 8>(
        V::add32(V::sum_of_products16(chroma, weights), V::set32(kBt601Half << 8)));
  }
};

// As half_bgr_row_portable<2>; returns the first pixel that it did not write.
template <typename V>
int half_bgr_row_x86(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int end) {
  using Int = typename V::Int;
  const Int chroma_zero = V::set8(kChromaZero);
  const Int low_bytes = V::set16(0x00FF);
  int x = 0;
  for (; x + V::kBytes <= end; x += V::kBytes) {
    const Int y_low = V::bit_and(V::load(luma + 2 * x), low_bytes);
    const Int y_high = V::bit_and(V::load(luma + 2 * x + V::kBytes), low_bytes);
    const ChannelOffsetsX86<V> low(V::bit_xor(V::load(vu + 2 * x), chroma_zero));
    const ChannelOffsetsX86<V> high(V::bit_xor(V::load(vu + 2 * x + V::kBytes), chroma_zero));
    V::store_three(bgr + 3 * x, V::clamp16(V::add16(y_low, low.blue), V::add16(y_high, high.blue)),
                   V::clamp16(V::add16(y_low, low.green), V::add16(y_high, high.green)),
                   V::clamp16(V::add16(y_low, low.red), V::add16(y_high, high.red)));
  }
  return x;
}

// As ycrcb_to_bgr_portable; returns the first pixel that it did not write. Widening and narrowing
// both work within 128-bit lanes and cancel out.
template <typename V>
size_t ycrcb_to_bgr_x86(const uint8_t* ycrcb, uint8_t* bgr, size_t end) {
  using Int = typename V::Int;
  const Int zero = V::set8(0);
  const Int chroma_zero = V::set8(kChromaZero);
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    Int c[3];
    V::load_three(ycrcb + 3 * i, c);
    const Int cr = V::bit_xor(c[1], chroma_zero);
    const Int cb = V::bit_xor(c[2], chroma_zero);
    const Int y_low = V::interleave_low8(c[0], zero);
    const Int y_high = V::interleave_high8(c[0], zero);
    const ChannelOffsetsX86<V> low(V::interleave_low8(cr, cb));
    const ChannelOffsetsX86<V> high(V::interleave_high8(cr, cb));
    V::store_three(bgr + 3 * i,
                   V::clamp16_by_lanes(V::add16(y_low, low.blue), V::add16(y_high, high.blue)),
                   V::clamp16_by_lanes(V::add16(y_low, low.green), V::add16(y_high, high.green)),
                   V::clamp16_by_lanes(V::add16(y_low, low.red), V::add16(y_high, high.red)));
  }
  return i;
}

// Luma and chroma of half a vector of pixels, as 16-bit values; chroma reduced to its low byte.
template <typename V>
struct YCrCbStep {
  using Int = typename V::Int;
  Int y;
  Int cr;
  Int cb;

  YCrCbStep(Int blue, Int green, Int red) {
    y = V::narrow32(
        luma(V::interleave_low16(blue, green), V::interleave_low16(red, V::set16(1))),
        luma(V::interleave_high16(blue, green), V::interleave_high16(red, V::set16(1))));
    cr = chroma(V::sub16(red, y), kBt601CrFromRed);
    cb = chroma(V::sub16(blue, y), kBt601CbFromBlue);
  }

 private:
  // The rounding term is the weight of the constant 1 beside red.
  static Int luma(Int blue_green, Int red_one) {
    const Int sum = V::add32(
        V::sum_of_products16(blue_green, V::set_pairs16(kBt601LumaFromBlue, kBt601LumaFromGreen)),
        V::sum_of_products16(red_one, V::set_pairs16(kBt601LumaFromRed, kBt601Half)));
    return V::template shift_right32<kBt601Bits>(sum);
  }
  // 128 + ((difference * weight + 2^13) >> 14), of which 256 becomes 0.
  static Int chroma(Int difference, int weight) {
    const Int product =
        V::round_high_product16(V::template shift_left16<1>(difference), V::set16(weight));
    return V::bit_and(V::add16(product, V::set16(kChromaZero)), V::set16(0x00FF));
  }
};

// As bgr_to_ycrcb_portable; returns the first pixel that it did not write.
template <typename V>
size_t bgr_to_ycrcb_x86(const uint8_t* bgr, uint8_t* ycrcb, size_t end) {
  using Int = typename V::Int;
  const Int zero = V::set8(0);
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    Int c[3];
    V::load_three(bgr + 3 * i, c);
    const YCrCbStep<V> low(V::interleave_low8(c[0], zero), V::interleave_low8(c[1], zero),
                           V::interleave_low8(c[2], zero));
    const YCrCbStep<V> high(V::interleave_high8(c[0], zero), V::interleave_high8(c[1], zero),
                            V::interleave_high8(c[2], zero));
    V::store_three(ycrcb + 3 * i, V::clamp16_by_lanes(low.y, high.y),
                   V::clamp16_by_lanes(low.cr, high.cr), V::clamp16_by_lanes(low.cb, high.cb));
  }
  return i;
}

}  // namespace haze::color
