// The haze model inverted for one sample, J = A + (I - A) / t, and for all 256 samples at once.
#pragma once

#include <stdint.h>

#include "core/target.h"

namespace haze::recover {

// 1 / t for a transmission code: t = (code + 40) / 200.
constexpr float recovery_factor(int code) { return static_cast<float>(200.0 / (code + 40)); }

// clamp(trunc(anchor + (sample - anchor) * factor)). The product is rounded before the sum.
inline uint8_t recover_sample(int anchor, float factor, int sample) {
  const float value = static_cast<float>(anchor) + static_cast<float>(sample - anchor) * factor;
  const float below_256 = value > 255.0f ? 255.0f : value;
  return static_cast<uint8_t>(static_cast<int>(below_256 > 0.0f ? below_256 : 0.0f));
}

// recovered[v] = recover_sample(anchor, factor, v) for every byte v.
inline void recover_all_portable(int anchor, float factor, uint8_t* recovered) {
  for (int sample = 0; sample < 256; ++sample)
    recovered[sample] = recover_sample(anchor, factor, sample);
}

#if HAZE_NEON
// Four values as truncated integers; the caller's saturating narrowing clamps them to a byte.
inline int16x4_t recover_four_neon(float32x4_t anchor, float32x4_t factor, float32x4_t offset) {
  return vqmovn_s32(vcvtq_s32_f32(vaddq_f32(anchor, vmulq_f32(offset, factor))));
}

// Same bytes, eight a step. Range: the factor is at most 5, so values lie within +-1530.
inline void recover_all_neon(int anchor, float factor, uint8_t* recovered) {
  const float32x4_t anchors = vdupq_n_f32(static_cast<float>(anchor));
  const float32x4_t factors = vdupq_n_f32(factor);
  const float first[4] = {0.0f, 1.0f, 2.0f, 3.0f};
  const float32x4_t four = vdupq_n_f32(4.0f);
  // sample - anchor, exact in single precision
  float32x4_t offset = vsubq_f32(vld1q_f32(first), anchors);
  for (int sample = 0; sample < 256; sample += 8) {
    const int16x4_t low = recover_four_neon(anchors, factors, offset);
    offset = vaddq_f32(offset, four);
    const int16x4_t high = recover_four_neon(anchors, factors, offset);
    offset = vaddq_f32(offset, four);
    vst1_u8(recovered + sample, vqmovun_s16(vcombine_s16(low, high)));
  }
}
#endif

inline void recover_all(int anchor, float factor, uint8_t* recovered) {
#if HAZE_NEON
  recover_all_neon(anchor, factor, recovered);
#else
  recover_all_portable(anchor, factor, recovered);
#endif
}

}  // namespace haze::recover
