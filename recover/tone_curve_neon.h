// The tone curve on vectors of bytes, from tables that fit registers.
#pragma once

#include <stdint.h>

#include "core/target.h"

#if HAZE_NEON
namespace haze::recover {

// From 24 on, each eighth h = x / 8 of the curve is nearly a straight line, which differs from x by
//
//   base[h] + ((step[h] * (x + 184) mod 256 + 64) >> 7)
//
// modulo 256. The byte product wraps, so a step sets where in its eight inputs the line moves on,
// by one at most: the constants were found by trying all of them. The tests hold every byte against
// the curve. The darkest 24 inputs are taken from the curve itself.
inline constexpr uint8_t kToneSteps[32] = {0,   0,   0,   32,  32,  11,  20,  14,  0,   11, 0,
                                           234, 0,   0,   240, 0,   237, 242, 247, 0,   0,  242,
                                           248, 249, 234, 241, 239, 231, 237, 247, 233, 238};
inline constexpr uint8_t kToneBases[32] = {0,  0,  0,  7,  9,  10, 12,  13,  14,  14, 15,
                                           14, 14, 14, 13, 13, 11, 11,  10,  10,  9,  7,
                                           6,  4,  4,  3,  1,  0,  255, 254, 252, 251};
inline constexpr uint8_t kTonePhase = 184;

struct ToneCurveNeon {
  uint8x8x4_t steps;
  uint8x8x4_t bases;
  uint8x8x3_t darkest;
};

inline uint8x8x4_t load_32_neon(const uint8_t* bytes) {
  return {{vld1_u8(bytes), vld1_u8(bytes + 8), vld1_u8(bytes + 16), vld1_u8(bytes + 24)}};
}

inline ToneCurveNeon load_tone_curve_neon(const uint8_t* curve) {
  return {load_32_neon(kToneSteps),
          load_32_neon(kToneBases),
          {{vld1_u8(curve), vld1_u8(curve + 8), vld1_u8(curve + 16)}}};
}

// Sixteen bytes through the curve.
inline uint8x16_t brighten_neon(uint8x16_t x, const ToneCurveNeon& tone) {
  const uint8x16_t h = vshrq_n_u8(x, 3);
  const uint8x16_t step =
      vcombine_u8(vtbl4_u8(tone.steps, vget_low_u8(h)), vtbl4_u8(tone.steps, vget_high_u8(h)));
  const uint8x16_t base =
      vcombine_u8(vtbl4_u8(tone.bases, vget_low_u8(h)), vtbl4_u8(tone.bases, vget_high_u8(h)));
  const uint8x16_t moves = vmulq_u8(step, vaddq_u8(x, vdupq_n_u8(kTonePhase)));
  const uint8x16_t line = vrsraq_n_u8(vaddq_u8(base, x), moves, 7);
  // An index beyond its table leaves the byte as it is.
  return vcombine_u8(vtbx3_u8(vget_low_u8(line), tone.darkest, vget_low_u8(x)),
                     vtbx3_u8(vget_high_u8(line), tone.darkest, vget_high_u8(x)));
}

}  // namespace haze::recover
#endif
