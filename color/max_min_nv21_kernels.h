// Row kernels of the half-resolution minimum and maximum channels of an NV21 frame.
#pragma once

#include <stdint.h>

#include "color/bt601.h"
#include "core/numeric.h"
#include "core/target.h"

namespace haze::color {

// Output pixels [begin, end) of one row. `luma` is the even luma row, `chroma` the chroma row that
// belongs to it.
//
// Range: |Cr|, |Cb| <= 128, so each sum of products stays below 2^22 in size and each offset within
// -227 ... 226. Clamping is monotone, hence the minimum and maximum can be taken of the offsets and
// clamped after luma has been added once.
inline void max_min_row_portable(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                                 uint8_t* max_out, int begin, int end) {
  for (int x = begin; x < end; ++x) {
    const int y = luma[2 * x];
    const int cr = chroma[2 * x] - kChromaZero;
    const int cb = chroma[2 * x + 1] - kChromaZero;
    const int blue = (kBt601BlueFromCb * cb + kBt601Half) >> kBt601Bits;
    const int green = (kBt601Half - kBt601GreenFromCr * cr - kBt601GreenFromCb * cb) >> kBt601Bits;
    const int red = (kBt601RedFromCr * cr + kBt601Half) >> kBt601Bits;
    min_out[x] = clamp_to_byte(y + min(blue, min(green, red)));
    max_out[x] = clamp_to_byte(y + max(blue, max(green, red)));
  }
}

#if HAZE_NEON
// Same bytes, eight pixels a step; returns the first pixel that it did not write.
inline int max_min_row_neon(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                            uint8_t* max_out, int end) {
  // Twice the chroma less 128: 2c - 256 = 2 (c - 128) lies in -256 ... 254.
  const int16x8_t twice_zero = vdupq_n_s16(2 * kChromaZero);
  // One register of weights: blue and red; both of green are even and halved.
  const int16_t weight_values[4] = {kBt601BlueFromCb, kBt601RedFromCr, -kBt601GreenFromCr / 2,
                                    -kBt601GreenFromCb / 2};
  const int16x4_t weights = vld1_s16(weight_values);
  int x = 0;
  for (; x + 8 <= end; x += 8) {
    const uint8x8_t y = vld2_u8(luma + 2 * x).val[0];
    const uint8x8x2_t crcb = vld2_u8(chroma + 2 * x);
    const int16x8_t cr2 = vsubq_s16(vreinterpretq_s16_u16(vshll_n_u8(crcb.val[0], 1)), twice_zero);
    const int16x8_t cb2 = vsubq_s16(vreinterpretq_s16_u16(vshll_n_u8(crcb.val[1], 1)), twice_zero);
    // Exact: vqrdmulh(2c, k) = (2 * 2c * k + 2^15) >> 16 = (c * k + 2^13) >> 14. It saturates only
    // where both factors are -2^15.
    const int16x8_t blue = vqrdmulhq_lane_s16(cb2, weights, 0);
    const int16x8_t red = vqrdmulhq_lane_s16(cr2, weights, 1);
    // Two products must be summed before rounding: half a weight times 2c is the same product, and
    // vrshrn adds 2^13 before it shifts.
    const int32x4_t green_low = vmlal_lane_s16(vmull_lane_s16(vget_low_s16(cr2), weights, 2),
                                               vget_low_s16(cb2), weights, 3);
    const int32x4_t green_high = vmlal_lane_s16(vmull_lane_s16(vget_high_s16(cr2), weights, 2),
                                                vget_high_s16(cb2), weights, 3);
    const int16x8_t green =
        vcombine_s16(vrshrn_n_s32(green_low, kBt601Bits), vrshrn_n_s32(green_high, kBt601Bits));
    const int16x8_t least = vminq_s16(blue, vminq_s16(green, red));
    const int16x8_t most = vmaxq_s16(blue, vmaxq_s16(green, red));
    // Adding luma wraps as unsigned and reads back as signed: the sum lies in -227 ... 481.
    const uint16x8_t low = vaddw_u8(vreinterpretq_u16_s16(least), y);
    const uint16x8_t high = vaddw_u8(vreinterpretq_u16_s16(most), y);
    vst1_u8(min_out + x, vqmovun_s16(vreinterpretq_s16_u16(low)));
    vst1_u8(max_out + x, vqmovun_s16(vreinterpretq_s16_u16(high)));
  }
  return x;
}
static_assert(kBt601GreenFromCr % 2 == 0 && kBt601GreenFromCb % 2 == 0);
#endif

inline void max_min_row(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                        uint8_t* max_out, int width) {
  int x = 0;
#if HAZE_NEON
  x = max_min_row_neon(luma, chroma, min_out, max_out, width);
#endif
  max_min_row_portable(luma, chroma, min_out, max_out, x, width);
}

}  // namespace haze::color
