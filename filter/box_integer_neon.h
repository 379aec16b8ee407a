// Row kernels of the integer box filters on NEON. Each returns the first column or pixel that it
// did not touch.
#pragma once

#include <stdint.h>

#include "core/target.h"

#if HAZE_NEON
namespace haze::filter {

inline void accumulate_neon(int16_t* sums, int16x8_t change) {
  vst1q_s16(sums, vaddq_s16(vld1q_s16(sums), change));
}
inline void accumulate_neon(int32_t* sums, int16x8_t change) {
  vst1q_s32(sums, vaddw_s16(vld1q_s32(sums), vget_low_s16(change)));
  vst1q_s32(sums + 4, vaddw_s16(vld1q_s32(sums + 4), vget_high_s16(change)));
}

// Each change of column sums, sixteen columns a step. Whole registers are loaded because Clang
// takes eight-byte loads that are widened through the stack.
//
// sums[x] += entering[x] - leaving[x]. The differences wrap as unsigned and read back as signed.
template <typename Sum>
inline int slide_rows_neon(Sum* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  int x = 0;
  for (; x + 16 <= width; x += 16) {
    const uint8x16_t more = vld1q_u8(entering + x);
    const uint8x16_t less = vld1q_u8(leaving + x);
    const uint16x8_t low = vsubl_u8(vget_low_u8(more), vget_low_u8(less));
    const uint16x8_t high = vsubl_u8(vget_high_u8(more), vget_high_u8(less));
    accumulate_neon(sums + x, vreinterpretq_s16_u16(low));
    accumulate_neon(sums + x + 8, vreinterpretq_s16_u16(high));
  }
  return x;
}

// sums[x] += row[x]
template <typename Sum>
inline int add_row_neon(Sum* sums, const uint8_t* row, int width) {
  int x = 0;
  for (; x + 16 <= width; x += 16) {
    const uint8x16_t more = vld1q_u8(row + x);
    accumulate_neon(sums + x, vreinterpretq_s16_u16(vmovl_u8(vget_low_u8(more))));
    accumulate_neon(sums + x + 8, vreinterpretq_s16_u16(vmovl_u8(vget_high_u8(more))));
  }
  return x;
}

// sums[x] -= row[x]
template <typename Sum>
inline int subtract_row_neon(Sum* sums, const uint8_t* row, int width) {
  int x = 0;
  const uint8x8_t zero = vdup_n_u8(0);
  for (; x + 16 <= width; x += 16) {
    const uint8x16_t less = vld1q_u8(row + x);
    accumulate_neon(sums + x, vreinterpretq_s16_u16(vsubl_u8(zero, vget_low_u8(less))));
    accumulate_neon(sums + x + 8, vreinterpretq_s16_u16(vsubl_u8(zero, vget_high_u8(less))));
  }
  return x;
}

// Sums of four windows: those of the window before, in the last lane of `before`, and the changes
// from one to the next.
inline int32x4_t running_sums_neon(int32x4_t before, int32x4_t changes) {
  const int32x4_t zero = vdupq_n_s32(0);
  changes = vaddq_s32(changes, vextq_s32(zero, changes, 3));
  changes = vaddq_s32(changes, vextq_s32(zero, changes, 2));
  return vaddq_s32(changes, vdupq_lane_s32(vget_high_s32(before), 1));
}

// Means of windows of 64 columns and 32 ... 64 rows, by reciprocal.
//
// With v = sum / 64 <= 255 * rows, truncated, the mean is v / rows. vqrdmulh and the shift give
// (v * m + 2^14) >> 20, where m = (2^20 - e) / rows and 1 <= e <= rows: v / rows, less at most
// 255 * 64 / 2^20 < 1 / 64 (and not equal unless v = 0), plus 1 / 64. That never falls below
// v / rows, and stays below the next integer, which is 1 / rows >= 1 / 64 away at least.
//
// Divided in double precision, which truncates to the same: 32-bit ARM calls its run-time library
// for integers.
inline int16x8_t reciprocal_of_rows(int rows) {
  return vdupq_n_s16(static_cast<int16_t>(1048575.0 / rows));
}
inline uint8x8_t means_64_neon(int32x4_t low, int32x4_t high, int16x8_t reciprocal) {
  const int16x8_t v = vcombine_s16(vshrn_n_s32(low, 6), vshrn_n_s32(high, 6));
  return vshrn_n_u16(vreinterpretq_u16_s16(vqrdmulhq_s16(v, reciprocal)), 5);
}

// Means of windows of 64 columns that move on by one column per pixel, 32 pixels a step: `sum` is
// the window's before the first of them; entering[x] and leaving[x] are the column sums that pixel
// x adds and drops. Returns the first pixel that it did not write, and leaves the sum of the pixel
// before it.
//
// The loads deal four neighbouring pixels out to four vectors, so that seven of eight additions of
// the running sum go side by side: lane l of vector k is pixel 4 l + k.
inline int mean_windows_64_neon(const int16_t* entering, const int16_t* leaving, uint8_t* dst,
                                int pixels, int32_t& sum, int rows) {
  const int16x8_t reciprocal = reciprocal_of_rows(rows);
  int32x4_t last = vdupq_n_s32(sum);
  int x = 0;
  for (; x + 32 <= pixels; x += 32) {
    const int16x8x4_t more = vld4q_s16(entering + x);
    const int16x8x4_t less = vld4q_s16(leaving + x);
    // Range: columns sum to 0 ... 16,320, so two changes stay within +-32,640.
    const int16x8_t c0 = vsubq_s16(more.val[0], less.val[0]);
    const int16x8_t c1 = vaddq_s16(c0, vsubq_s16(more.val[1], less.val[1]));
    const int16x8_t c2 = vsubq_s16(more.val[2], less.val[2]);
    const int16x8_t c3 = vaddq_s16(c2, vsubq_s16(more.val[3], less.val[3]));
    // Sums of every fourth window, and of the ones before the groups of four.
    const int32x4_t low = running_sums_neon(last, vaddl_s16(vget_low_s16(c1), vget_low_s16(c3)));
    const int32x4_t high = running_sums_neon(low, vaddl_s16(vget_high_s16(c1), vget_high_s16(c3)));
    const int32x4_t low_before = vextq_s32(last, low, 3);
    const int32x4_t high_before = vextq_s32(low, high, 3);
    const int32x4_t low1 = vaddw_s16(low_before, vget_low_s16(c1));
    const int32x4_t high1 = vaddw_s16(high_before, vget_high_s16(c1));
    uint8x8x4_t means;  // filled one by one: GCC takes a whole initialiser through the stack
    means.val[0] = means_64_neon(vaddw_s16(low_before, vget_low_s16(c0)),
                                 vaddw_s16(high_before, vget_high_s16(c0)), reciprocal);
    means.val[1] = means_64_neon(low1, high1, reciprocal);
    means.val[2] = means_64_neon(vaddw_s16(low1, vget_low_s16(c2)),
                                 vaddw_s16(high1, vget_high_s16(c2)), reciprocal);
    means.val[3] = means_64_neon(low, high, reciprocal);
    vst4_u8(dst + x, means);
    last = high;
  }
  sum = vgetq_lane_s32(last, 3);
  return x;
}

// Division of window sums below 2^24 by their count of 2 ... 2^16 pixels.
//
// With 2^s < count <= 2^(s + 1) and m = (2^(31 + s) + e) / count, 0 < e <= 2 * count, the quotient
// is sum * m >> (31 + s): the error is sum * e / 2^(31 + s) < 2^(24 + 1 + s + 1 - 31 - s) = 2^-5 of
// 1 / count. Sums come scaled by 2^(16 - s), which leaves them below 255 * 2^17, so that vqdmulh,
// which shifts by 31, puts the quotient above 16 bits of fraction.
struct CountNeon {
  int32x4_t reciprocal;
  int32x4_t scale;

  explicit CountNeon(int count) {
    int s = 0;
    while (2 << s < count) ++s;
    // Exact in double precision but for the last bits of a quotient below 2^31.
    const double quotient = 0x1p31 * (1 << s) / count;
    reciprocal = vdupq_n_s32(static_cast<int32_t>(quotient) + 1);
    scale = vdupq_n_s32(16 - s);
  }

  // In the high half of each word.
  uint32x4_t divide(int32x4_t sums) const {
    return vreinterpretq_u32_s32(vqdmulhq_s32(vshlq_s32(sums, scale), reciprocal));
  }
};

// As mean_windows_64_neon for windows of any size, sixteen pixels a step.
inline int mean_windows_32_neon(const int32_t* entering, const int32_t* leaving, uint8_t* dst,
                                int pixels, int32_t& sum, int count) {
  const CountNeon divisor(count);
  int32x4_t last = vdupq_n_s32(sum);
  int x = 0;
  for (; x + 16 <= pixels; x += 16) {
    const int32x4x4_t more = vld4q_s32(entering + x);
    const int32x4x4_t less = vld4q_s32(leaving + x);
    const int32x4_t c0 = vsubq_s32(more.val[0], less.val[0]);
    const int32x4_t c1 = vaddq_s32(c0, vsubq_s32(more.val[1], less.val[1]));
    const int32x4_t c2 = vaddq_s32(c1, vsubq_s32(more.val[2], less.val[2]));
    const int32x4_t c3 = vaddq_s32(c2, vsubq_s32(more.val[3], less.val[3]));
    const int32x4_t sums3 = running_sums_neon(last, c3);
    const int32x4_t before = vextq_s32(last, sums3, 3);
    const uint32x4_t mean0 = divisor.divide(vaddq_s32(before, c0));
    const uint32x4_t mean1 = divisor.divide(vaddq_s32(before, c1));
    const uint32x4_t mean2 = divisor.divide(vaddq_s32(before, c2));
    const uint32x4_t mean3 = divisor.divide(sums3);
    // Two neighbours in the halves of each word, then in its low bytes.
    const uint16x8_t means01 = vreinterpretq_u16_u32(vsriq_n_u32(mean1, mean0, 16));
    const uint16x8_t means23 = vreinterpretq_u16_u32(vsriq_n_u32(mean3, mean2, 16));
    uint16x4x2_t means;
    means.val[0] = vreinterpret_u16_u8(vmovn_u16(means01));
    means.val[1] = vreinterpret_u16_u8(vmovn_u16(means23));
    vst2_u16(reinterpret_cast<uint16_t*>(dst + x), means);
    last = sums3;
  }
  sum = vgetq_lane_s32(last, 3);
  return x;
}

}  // namespace haze::filter
#endif
