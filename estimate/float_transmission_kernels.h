// Kernels of the per-pixel float transmission.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"

namespace haze::estimate {

inline constexpr float kLeastFloatTransmission = 0.4f;

// clamp(1 - scale * byte) to [0.4, 1]; what is not a number is handed on.
inline float clamped_transmission(float scale, uint8_t byte) {
  const float t = 1.0f - scale * static_cast<float>(byte);
  return t > 1.0f ? 1.0f : t < kLeastFloatTransmission ? kLeastFloatTransmission : t;
}

#if HAZE_X86
// t[i] = the largest clamped transmission of the three channels of pixel i; each returns the first
// pixel that it did not write.
size_t largest_transmissions_avx2(const uint8_t* pixels, const float* scales, float least, float* t,
                                  size_t end);
size_t largest_transmissions_avx512(const uint8_t* pixels, const float* scales, float least,
                                    float* t, size_t end);
#endif

}  // namespace haze::estimate
