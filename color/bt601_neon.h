// YCrCb to RGB of BT.601, eight pixels at once.
#pragma once

#include <stdint.h>

#include "color/bt601.h"
#include "core/target.h"

#if HAZE_NEON
namespace haze::color {

struct ChannelOffsetsNeon {
  int16x8_t blue;
  int16x8_t green;
  int16x8_t red;
};

// Weights for channel_offsets_neon: blue and red; both of green, which are even, negated and
// halved.
inline int16x4_t channel_weights_neon() {
  static_assert(kBt601GreenFromCr % 2 == 0 && kBt601GreenFromCb % 2 == 0);
  const int16_t weights[4] = {kBt601BlueFromCb, kBt601RedFromCr, -kBt601GreenFromCr / 2,
                              -kBt601GreenFromCb / 2};
  int16x4_t loaded = vld1_s16(weights);
  // Opaque to Clang, which would otherwise spread the constants over whole registers, run out of
  // them and load them again for every eight pixels.
  __asm__("" : "+w"(loaded));
  return loaded;
}

// Chroma bytes less 128: inverting the highest bit of a byte takes 128 from its signed reading.
inline int8x16_t centred_neon(uint8x16_t chroma) {
  return vreinterpretq_s8_u8(veorq_u8(chroma, vdupq_n_u8(kChromaZero)));
}

// channel_offsets of eight chroma pairs, less 128.
inline ChannelOffsetsNeon channel_offsets_neon(int8x8_t cr, int8x8_t cb, int16x4_t weights) {
  const int16x8_t cr2 = vshll_n_s8(cr, 1);
  const int16x8_t cb2 = vshll_n_s8(cb, 1);
  // Two products must be summed before rounding: half a weight times 2c is the same product, and
  // vrshrn adds 2^13 before it shifts.
  const int32x4_t green_low =
      vmlal_lane_s16(vmull_lane_s16(vget_low_s16(cr2), weights, 2), vget_low_s16(cb2), weights, 3);
  const int32x4_t green_high = vmlal_lane_s16(vmull_lane_s16(vget_high_s16(cr2), weights, 2),
                                              vget_high_s16(cb2), weights, 3);
  // Exact: vqrdmulh(2c, k) = (2 * 2c * k + 2^15) >> 16 = (c * k + 2^13) >> 14. It saturates only
  // where both factors are -2^15.
  return {vqrdmulhq_lane_s16(cb2, weights, 0),
          vcombine_s16(vrshrn_n_s32(green_low, kBt601Bits), vrshrn_n_s32(green_high, kBt601Bits)),
          vqrdmulhq_lane_s16(cr2, weights, 1)};
}

// Luma plus an offset, clamped to bytes. The addition wraps as unsigned and reads back as signed:
// the sum lies in -227 ... 481.
inline uint8x8_t add_clamped_neon(uint8x8_t luma, int16x8_t offset) {
  return vqmovun_s16(vreinterpretq_s16_u16(vaddw_u8(vreinterpretq_u16_s16(offset), luma)));
}

}  // namespace haze::color
#endif
