// Kernels of the per-pixel float transmission.
#pragma once

#include <float.h>
#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "core/target.h"
#include "estimate/byte_floats_neon.h"

namespace haze::estimate {

inline constexpr float kLeastFloatTransmission = 0.4f;

// clamp(1 - scale * byte) to [0.4, 1]; what is not a number is handed on.
inline float clamped_transmission(float scale, uint8_t byte) {
  const float t = 1.0f - scale * static_cast<float>(byte);
  return t > 1.0f ? 1.0f : t < kLeastFloatTransmission ? kLeastFloatTransmission : t;
}

#if HAZE_NEON
// The largest clamped transmission of byte k of each word of the three channels. Transmissions
// never rise with the product, so the least product gives the largest one. They cannot exceed 1.
template <int kByte>
inline float32x4_t largest_transmission_neon(const uint8x16x3_t& pixels,
                                             const float32x4_t (&scales)[3]) {
  const float32x4_t first = vmulq_f32(byte_to_float_neon<kByte>(pixels.val[0]), scales[0]);
  const float32x4_t second = vmulq_f32(byte_to_float_neon<kByte>(pixels.val[1]), scales[1]);
  const float32x4_t third = vmulq_f32(byte_to_float_neon<kByte>(pixels.val[2]), scales[2]);
  const float32x4_t least = vminq_f32(vminq_f32(first, second), third);
  return vmaxq_f32(vsubq_f32(vdupq_n_f32(1.0f), least), vdupq_n_f32(kLeastFloatTransmission));
}

// t[i] = the largest clamped transmission of the three channels of pixel i, sixteen pixels a step;
// returns the first pixel that it did not write. A light of 0, whose scale is no number, is left to
// the tables.
inline size_t largest_transmissions_neon(const uint8_t* pixels, const float (&scales)[3], float* t,
                                         size_t end) {
  for (const float scale : scales)
    if (!(scale <= FLT_MAX)) return 0;
  const float32x4_t vectors[3] = {vdupq_n_f32(scales[0]), vdupq_n_f32(scales[1]),
                                  vdupq_n_f32(scales[2])};
  const size_t whole = end / 16 * 16;
  for (const float* const stop = t + whole; t != stop; t += 16) {
    const uint8x16x3_t channels = vld3q_u8(pixels);
    pixels += 48;
    float32x4x4_t largest;
    largest.val[0] = largest_transmission_neon<0>(channels, vectors);
    largest.val[1] = largest_transmission_neon<1>(channels, vectors);
    largest.val[2] = largest_transmission_neon<2>(channels, vectors);
    largest.val[3] = largest_transmission_neon<3>(channels, vectors);
    vst4q_f32(t, largest);
  }
  return whole;
}
#endif

#if HAZE_X86
// t[i] = the largest clamped transmission of the three channels of pixel i; each returns the first
// pixel that it did not write.
size_t largest_transmissions_avx2(const uint8_t* pixels, const float* scales, float least, float* t,
                                  size_t end);
size_t largest_transmissions_avx512(const uint8_t* pixels, const float* scales, float least,
                                    float* t, size_t end);
#endif

}  // namespace haze::estimate
