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
#include "core/numeric.h"
#include "core/target.h"
#include "estimate/byte_floats_neon.h"
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

// Whether the code of min(strength * mean, minimum) / A can only fall when that minimum rises, with
// nothing on the way that is not a number.
constexpr bool are_monotone(GroupArguments arguments) {
  return arguments.strength >= 0.0f && arguments.strength <= FLT_MAX &&
         arguments.minus_inv_a <= 0.0f && arguments.minus_inv_a >= -FLT_MAX;
}

constexpr float flush_subnormal(float value) {
  return value < FLT_MIN && value > -FLT_MIN ? 0.0f : value;
}

constexpr GroupArguments group_arguments(float strength, float inv_a) {
  return {flush_subnormal(strength), 0.0f - flush_subnormal(inv_a)};
}

// t = 1 - least / A, T = trunc(200 * clamp(t) - 40).
//
// The comparisons are written so that a value that is not a number passes all of them unchanged.
// Range: a clamped t gives 40 ... 158 exactly (0.4f * 200 and 0.99f * 200 round to 80 and 198).
inline uint8_t group_code(float least, float minus_inv_a) {
  float t = 1.0f + least * minus_inv_a;
  t = t < kLeastTransmission ? kLeastTransmission : t;
  t = t > kMostTransmission ? kMostTransmission : t;
  const float value = -kCodeOffset + t * kCodeScale;
  return static_cast<uint8_t>(static_cast<int>(value == value ? value : 0.0f));
}

// Codes of pixels [begin, end), both multiples of eight, with least = min(strength * mean,
// minimum).
template <HighLanes kHighLanes>
inline void group_codes_portable(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes,
                                 size_t begin, size_t end, GroupArguments arguments) {
  for (size_t i = begin; i < end; ++i) {
    const float bound = minimum[kHighLanes == HighLanes::kOwn ? i : i & ~size_t{4}];
    const float scaled = static_cast<float>(mean[i]) * arguments.strength;
    codes[i] = group_code(scaled > bound ? bound : scaled, arguments.minus_inv_a);
  }
}

// The codes of every mean and of every minimum, each as if it were the lesser of the two. Where a
// code can only fall when that minimum rises, a pixel's code is the larger of its two entries: the
// code of a minimum of two values is the maximum of their codes.
struct CodeTables {
  static constexpr size_t kPixelsWorthIt = 4096;

  uint8_t of_mean[256];
  uint8_t of_minimum[256];
};

inline CodeTables group_code_tables(GroupArguments arguments) {
  CodeTables tables;
  for (int value = 0; value < 256; ++value) {
    const float sample = static_cast<float>(value);
    tables.of_mean[value] = group_code(sample * arguments.strength, arguments.minus_inv_a);
    tables.of_minimum[value] = group_code(sample, arguments.minus_inv_a);
  }
  return tables;
}

#if HAZE_X86
// The first codes from tables; returns the first pixel that it did not write.
size_t look_up_codes_avx512(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                            const uint8_t* of_mean, const uint8_t* of_minimum);
#endif

inline void look_up_codes(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                          const CodeTables& tables) {
  size_t i = 0;
#if HAZE_X86
  if (cpu_level() == CpuLevel::kAvx512)
    i = look_up_codes_avx512(mean, minimum, codes, end, tables.of_mean, tables.of_minimum);
#endif
  for (; i < end; ++i) codes[i] = max(tables.of_mean[mean[i]], tables.of_minimum[minimum[i]]);
}

#if HAZE_NEON
// Whether t is a number that cannot exceed 1 whatever the pixel. Then codes may be clamped as
// bytes.
constexpr bool keeps_below_one(GroupArguments arguments) {
  return arguments.strength >= 0.0f && arguments.strength <= FLT_MAX &&
         arguments.minus_inv_a <= 0.0f && arguments.minus_inv_a >= -FLT_MAX;
}

inline constexpr uint8_t kCodeZero = static_cast<uint8_t>(kCodeOffset);

struct GroupVectors {
  float32x4_t strength;
  float32x4_t minus_inv_a;
};

// trunc(200 t) of byte k of each word. With kClampsFloats t is clamped: vmin and vmax hand on a
// value that is not a number, and the conversion turns it into 0. Otherwise t is at most 1, and
// negative products become 0.
template <int kByte, bool kClampsFloats>
inline uint32x4_t scaled_transmission_neon(uint8x16_t means, uint8x16_t minima,
                                           GroupVectors arguments) {
  const float32x4_t scaled = vmulq_f32(byte_to_float_neon<kByte>(means), arguments.strength);
  const float32x4_t least = vminq_f32(scaled, byte_to_float_neon<kByte>(minima));
  float32x4_t t = vaddq_f32(vdupq_n_f32(1.0f), vmulq_f32(least, arguments.minus_inv_a));
  if constexpr (kClampsFloats) {
    t = vmaxq_f32(t, vdupq_n_f32(kLeastTransmission));
    t = vminq_f32(t, vdupq_n_f32(kMostTransmission));
  }
  return vcvtq_u32_f32(vmulq_f32(t, vdupq_n_f32(kCodeScale)));
}

// Same bytes, sixteen pixels a step; returns the first pixel that it did not write.
//
// 40 is taken off the truncated products: between 80 and 198 the difference of the floats is exact,
// so it truncates to the same. Codes never fall as t grows, so clamping them instead of t changes
// nothing.
template <HighLanes kHighLanes, bool kClampsFloats>
inline size_t clamped_group_codes_neon(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes,
                                       size_t end, GroupArguments arguments) {
  const GroupVectors vectors = {vdupq_n_f32(arguments.strength),
                                vdupq_n_f32(arguments.minus_inv_a)};
  const size_t whole = end / (2 * kGroup) * (2 * kGroup);
  for (const uint8_t* const stop = codes + whole; codes != stop; codes += 2 * kGroup) {
    const uint8x16_t means = vld1q_u8(mean);
    uint8x16_t minima = vld1q_u8(minimum);
    mean += 2 * kGroup;
    minimum += 2 * kGroup;
    if constexpr (kHighLanes == HighLanes::kLow) {
      const uint32x4_t words = vreinterpretq_u32_u8(minima);
      minima = vreinterpretq_u8_u32(vtrnq_u32(words, words).val[0]);
    }
    const uint32x4_t t0 = scaled_transmission_neon<0, kClampsFloats>(means, minima, vectors);
    const uint32x4_t t1 = scaled_transmission_neon<1, kClampsFloats>(means, minima, vectors);
    const uint32x4_t t2 = scaled_transmission_neon<2, kClampsFloats>(means, minima, vectors);
    const uint32x4_t t3 = scaled_transmission_neon<3, kClampsFloats>(means, minima, vectors);
    // Each insertion writes over the bits above its byte.
    const uint32x4_t low = vsliq_n_u32(t0, t1, 8);
    uint8x16_t scaled = vreinterpretq_u8_u32(vsliq_n_u32(vsliq_n_u32(low, t2, 16), t3, 24));
    if constexpr (!kClampsFloats) {
      scaled = vmaxq_u8(scaled, vdupq_n_u8(kLeastCode + kCodeZero));
      scaled = vminq_u8(scaled, vdupq_n_u8(kMostCode + kCodeZero));
    }
    // Saturating, for what is not a number.
    vst1q_u8(codes, vqsubq_u8(scaled, vdupq_n_u8(kCodeZero)));
  }
  return whole;
}

template <HighLanes kHighLanes>
inline size_t group_codes_neon(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes,
                               size_t end, GroupArguments arguments) {
  return keeps_below_one(arguments)
             ? clamped_group_codes_neon<kHighLanes, false>(mean, minimum, codes, end, arguments)
             : clamped_group_codes_neon<kHighLanes, true>(mean, minimum, codes, end, arguments);
}
#endif

#if HAZE_X86
// Same bytes with the pixels' own minima; returns the first pixel that it did not write. In vectors
// of 32 bytes arithmetic is faster than lookups.
size_t group_codes_avx2(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                        float strength, float minus_inv_a);
#endif

// Codes of the first pixels with their own minima in a faster way, where there is one; returns how
// many.
inline size_t leading_codes(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                            GroupArguments arguments) {
#if HAZE_X86
  if (cpu_level() == CpuLevel::kAvx2)
    return group_codes_avx2(mean, minimum, codes, end, arguments.strength, arguments.minus_inv_a);
#endif
  if (end < CodeTables::kPixelsWorthIt || !are_monotone(arguments)) return 0;
  look_up_codes(mean, minimum, codes, end, group_code_tables(arguments));
  return end;
}

// Codes of whole groups, pixels [0, end).
template <HighLanes kHighLanes>
inline void group_codes(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                        GroupArguments arguments) {
  size_t done = 0;
#if HAZE_NEON
  done = group_codes_neon<kHighLanes>(mean, minimum, codes, end, arguments);
#else
  if constexpr (kHighLanes == HighLanes::kOwn)
    done = leading_codes(mean, minimum, codes, end, arguments);
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

// The code of `least`, the lesser of the mean's and the minimum's term in units of 1 / 256.
//
// Range: |t| may be anything, infinite or not a number; only 0.4 <= t <= 0.99 is converted.
inline uint8_t code_q8(int32_t least, int light) {
  const float t = (256.0f - static_cast<float>(least) / static_cast<float>(light)) * 0.00390625f;
  if (static_cast<double>(t) < 0.4) return kLeastCode;
  if (static_cast<double>(t) > 0.99) return kMostCode;
  if (t != t) return 0;
  return static_cast<uint8_t>(-kCodeOffset + t * kCodeScale);
}

// A product past 32 bits wraps.
inline int32_t scaled_q8(int strength_q8, int mean) {
  return static_cast<int32_t>(static_cast<uint32_t>(strength_q8) * static_cast<uint32_t>(mean));
}

// Codes by whole numbers: t = (256 - min(strength * mean, 256 * minimum) / light) / 256.
inline void codes_q8(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t count,
                     int strength_q8, int light) {
  if (light > 0 && count >= CodeTables::kPixelsWorthIt) {
    CodeTables tables;
    for (int value = 0; value < 256; ++value) {
      tables.of_mean[value] = code_q8(scaled_q8(strength_q8, value), light);
      tables.of_minimum[value] = code_q8(256 * value, light);
    }
    look_up_codes(mean, minimum, codes, count, tables);
    return;
  }
  for (size_t i = 0; i < count; ++i)
    codes[i] = code_q8(min(256 * minimum[i], scaled_q8(strength_q8, mean[i])), light);
}

}  // namespace haze::estimate
