// Bytes as floats on NEON.
#pragma once

#include <stdint.h>

#include "core/target.h"

#if HAZE_NEON
namespace haze::estimate {

// Every fourth of sixteen bytes, as floats: byte k of each 32-bit word. Masked where it stands and
// converted as a number with 8 k bits of fraction, which is exact and spares the widening.
template <int kByte>
inline float32x4_t byte_to_float_neon(uint8x16_t bytes) {
  const uint32x4_t words = vreinterpretq_u32_u8(bytes);
  const uint32x4_t masked = vandq_u32(words, vdupq_n_u32(0xFFu << (8 * kByte)));
  if constexpr (kByte == 0)
    return vcvtq_f32_u32(masked);
  else
    return vcvtq_n_f32_u32(masked, 8 * kByte);
}

}  // namespace haze::estimate
#endif
