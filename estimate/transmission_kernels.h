// Kernels of the transmission map on flat arrays of pixels.
//
// The map is computed in groups of eight pixels with a tail of up to seven. Group and tail agree
// for every number; where t is not a number (a light of 0) a group gives code 0, as a saturating
// conversion of a vector unit does, and the tail the least code.
#pragma once

#include <float.h>
#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "core/target.h"
#include "estimate/transmission_code.h"

namespace haze::estimate {

inline constexpr size_t kGroup = 8;

// Which minimum channel pixels 4 ... 7 of a group are held against: their own, or by a defect that
// callers may rely on, those of pixels 0 ... 3.
enum class HighLanes { kOwn, kLow };

// Arguments of the groups. Vector units may treat numbers below the normal range as zero, so they
// are zero here on every target. The products need no such care: next to 1 a tiny one vanishes.
struct GroupArguments {
  float strength;
  float minus_inv_a;
};

constexpr float flush_subnormal(float value) {
  return value < FLT_MIN && value > -FLT_MIN ? 0.0f : value;
}

constexpr GroupArguments group_arguments(float strength, float inv_a) {
  return {flush_subnormal(strength), 0.0f - flush_subnormal(inv_a)};
}

// Codes of pixels [begin, end), both multiples of eight:
// t = 1 - min(strength * mean, minimum) / A, T = trunc(200 * clamp(t) - 40).
//
// The comparisons are written so that a value that is not a number passes all of them unchanged.
// Range: a clamped t gives 40 ... 158 exactly (0.4f * 200 and 0.99f * 200 round to 80 and 198).
template <HighLanes kHighLanes>
inline void group_codes_portable(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes,
                                 size_t begin, size_t end, GroupArguments arguments) {
  for (size_t i = begin; i < end; ++i) {
    const float bound = minimum[kHighLanes == HighLanes::kOwn ? i : i & ~size_t{4}];
    const float scaled = static_cast<float>(mean[i]) * arguments.strength;
    const float least = scaled > bound ? bound : scaled;
    float t = 1.0f + least * arguments.minus_inv_a;
    t = t < kLeastTransmission ? kLeastTransmission : t;
    t = t > kMostTransmission ? kMostTransmission : t;
    const float value = -kCodeOffset + t * kCodeScale;
    codes[i] = static_cast<uint8_t>(static_cast<int>(value == value ? value : 0.0f));
  }
}

#if HAZE_NEON
struct GroupVectors {
  float32x4_t strength;
  float32x4_t minus_inv_a;
};

// Eight pixels as two vectors of floats.
inline float32x4x2_t widen_to_float(uint8x8_t bytes) {
  const uint16x8_t wide = vmovl_u8(bytes);
  return {{vcvtq_f32_u32(vmovl_u16(vget_low_u16(wide))),
           vcvtq_f32_u32(vmovl_u16(vget_high_u16(wide)))}};
}

// vmin and vmax hand on a value that is not a number, vcvt truncates and turns it into 0.
inline uint16x8_t four_codes_neon(float32x4_t mean, float32x4_t bound, GroupVectors arguments) {
  const float32x4_t least = vminq_f32(vmulq_f32(mean, arguments.strength), bound);
  float32x4_t t = vaddq_f32(vdupq_n_f32(1.0f), vmulq_f32(least, arguments.minus_inv_a));
  t = vmaxq_f32(t, vdupq_n_f32(kLeastTransmission));
  t = vminq_f32(t, vdupq_n_f32(kMostTransmission));
  const float32x4_t value =
      vaddq_f32(vdupq_n_f32(-kCodeOffset), vmulq_f32(t, vdupq_n_f32(kCodeScale)));
  return vreinterpretq_u16_u32(vcvtq_u32_f32(value));
}

// Eight codes in the even bytes. Codes fit a byte, so narrowing keeps every second half.
template <HighLanes kHighLanes>
inline uint8x16_t eight_codes_neon(uint8x8_t mean_bytes, uint8x8_t minimum_bytes,
                                   GroupVectors arguments) {
  const float32x4x2_t mean = widen_to_float(mean_bytes);
  const float32x4x2_t bound = widen_to_float(minimum_bytes);
  return vreinterpretq_u8_u16(
      vuzpq_u16(
          four_codes_neon(mean.val[0], bound.val[0], arguments),
          four_codes_neon(mean.val[1], bound.val[kHighLanes == HighLanes::kOwn ? 1 : 0], arguments))
          .val[0]);
}

// Same bytes, sixteen pixels a step; returns the first pixel that it did not write. Whole registers
// are loaded because Clang takes eight-byte loads that are widened through the stack.
template <HighLanes kHighLanes>
inline size_t group_codes_neon(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes,
                               size_t end, GroupArguments arguments) {
  const GroupVectors vectors = {vdupq_n_f32(arguments.strength),
                                vdupq_n_f32(arguments.minus_inv_a)};
  size_t i = 0;
  for (; i + 2 * kGroup <= end; i += 2 * kGroup) {
    const uint8x16_t means = vld1q_u8(mean + i);
    const uint8x16_t minima = vld1q_u8(minimum + i);
    vst1q_u8(
        codes + i,
        vuzpq_u8(eight_codes_neon<kHighLanes>(vget_low_u8(means), vget_low_u8(minima), vectors),
                 eight_codes_neon<kHighLanes>(vget_high_u8(means), vget_high_u8(minima), vectors))
            .val[0]);
  }
  return i;
}
#endif

#if HAZE_X86
// Same bytes with the pixels' own minima; each returns the first pixel that it did not write.
size_t group_codes_avx2(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                        float strength, float minus_inv_a);
size_t group_codes_avx512(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                          float strength, float minus_inv_a);
#endif

// Codes of whole groups, pixels [0, end).
template <HighLanes kHighLanes>
inline void group_codes(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                        GroupArguments arguments) {
  size_t done = 0;
#if HAZE_NEON
  done = group_codes_neon<kHighLanes>(mean, minimum, codes, end, arguments);
#elif HAZE_X86
  if constexpr (kHighLanes == HighLanes::kOwn) {
    if (const auto kernel = x86_kernel(group_codes_avx2, group_codes_avx512))
      done = kernel(mean, minimum, codes, end, arguments.strength, arguments.minus_inv_a);
  }
#endif
  group_codes_portable<kHighLanes>(mean, minimum, codes, done, end, arguments);
}

// Codes of the pixels after the last group. The bounds are compared in double precision, which
// gives the same bytes: 0.4f and 0.99f are the floats next above 0.4 and 0.99.
inline void tail_codes(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t begin,
                       size_t end, float strength, float inv_a) {
  for (size_t i = begin; i < end; ++i) {
    const float bound = minimum[i];
    const float scaled = static_cast<float>(mean[i]) * strength;
    const float least = scaled > bound ? bound : scaled;
    const float t = 1.0f - least * inv_a;
    // Not "t <= 0.4": what is not a number belongs here.
    if (!(static_cast<double>(t) > 0.4))
      codes[i] = kLeastCode;
    else if (static_cast<double>(t) < 0.99)
      codes[i] = static_cast<uint8_t>(t * kCodeScale - kCodeOffset);
    else
      codes[i] = kMostCode;
  }
}

// Range: |t| may be anything, infinite or not a number; only 0.4 <= t <= 0.99 is converted.
inline uint8_t code_q8(int strength_q8, int light, uint8_t mean, uint8_t minimum) {
  // A product past 32 bits wraps.
  const int32_t scaled =
      static_cast<int32_t>(static_cast<uint32_t>(strength_q8) * static_cast<uint32_t>(mean));
  const int32_t bound = 256 * minimum;
  const float least = static_cast<float>(bound < scaled ? bound : scaled);
  const float t = (256.0f - least / static_cast<float>(light)) * 0.00390625f;
  if (static_cast<double>(t) < 0.4) return kLeastCode;
  if (static_cast<double>(t) > 0.99) return kMostCode;
  if (t != t) return 0;
  return static_cast<uint8_t>(-kCodeOffset + t * kCodeScale);
}

}  // namespace haze::estimate
