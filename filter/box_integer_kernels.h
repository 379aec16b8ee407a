// Row kernels of the integer box filters: column sums that slide down the image, and the means of
// one output row taken from them.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/target.h"
#include "filter/box_prefix.h"

namespace haze::filter {

// sums[x] = row[x].
template <typename Sum>
inline void start_columns(Sum* sums, const uint8_t* row, int width) {
  for (int x = 0; x < width; ++x) sums[x] = row[x];
}

// sums[x] += row[x]: a row enters the window.
template <typename Sum>
inline void add_row(Sum* sums, const uint8_t* row, int width) {
  for (int x = 0; x < width; ++x) sums[x] = static_cast<Sum>(sums[x] + row[x]);
}

// sums[x] -= row[x]: a row leaves it.
template <typename Sum>
inline void subtract_row(Sum* sums, const uint8_t* row, int width) {
  for (int x = 0; x < width; ++x) sums[x] = static_cast<Sum>(sums[x] - row[x]);
}

// A row enters and another leaves, columns [begin, end).
template <typename Sum>
inline void slide_rows_portable(Sum* sums, const uint8_t* entering, const uint8_t* leaving,
                                int begin, int end) {
  for (int x = begin; x < end; ++x)
    sums[x] = static_cast<Sum>(sums[x] + (entering[x] - leaving[x]));
}

#if HAZE_NEON
// Same sums, sixteen columns a step; returns the first column that it did not touch. Whole registers
// are loaded because Clang takes eight-byte loads that are widened through the stack.
inline int slide_rows_neon(int16_t* sums, const uint8_t* entering, const uint8_t* leaving,
                           int width) {
  int x = 0;
  for (; x + 16 <= width; x += 16) {
    const uint8x16_t more = vld1q_u8(entering + x);
    const uint8x16_t less = vld1q_u8(leaving + x);
    // The difference wraps as unsigned and reads back as signed.
    const int16x8_t low = vreinterpretq_s16_u16(vsubl_u8(vget_low_u8(more), vget_low_u8(less)));
    const int16x8_t high = vreinterpretq_s16_u16(vsubl_u8(vget_high_u8(more), vget_high_u8(less)));
    vst1q_s16(sums + x, vaddq_s16(vld1q_s16(sums + x), low));
    vst1q_s16(sums + x + 8, vaddq_s16(vld1q_s16(sums + x + 8), high));
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
inline int16x8_t reciprocal_of_rows(int rows) {
  return vdupq_n_s16(static_cast<int16_t>(((1 << 20) - 1) / rows));
}
inline uint8x8_t means_64_neon(int32x4_t low, int32x4_t high, int16x8_t reciprocal) {
  const int16x8_t v = vcombine_s16(vshrn_n_s32(low, 6), vshrn_n_s32(high, 6));
  return vshrn_n_u16(vreinterpretq_u16_s16(vqrdmulhq_s16(v, reciprocal)), 5);
}

// Means of windows of 64 columns that move on by one column per pixel, 32 pixels a step: `sum` is
// the window's before the first of them; entering[x] and leaving[x] are the column sums that pixel x
// adds and drops. Returns the first pixel that it did not write, and leaves the sum of the pixel
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
#endif

#if HAZE_X86
// Same sums; each returns the first column that it did not touch.
int slide_rows_avx2(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width);
int slide_rows_avx512(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width);

// Means of one output row whose windows hold `rows` rows, into row.means.
void mean_row_avx2(PrefixRow& row, int rows);
void mean_row_avx512(PrefixRow& row, int rows);
#endif

inline void slide_rows(int32_t* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  slide_rows_portable(sums, entering, leaving, 0, width);
}

inline void slide_rows(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  int x = 0;
#if HAZE_NEON
  x = slide_rows_neon(sums, entering, leaving, width);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(slide_rows_avx2, slide_rows_avx512))
    x = kernel(sums, entering, leaving, width);
#endif
  slide_rows_portable(sums, entering, leaving, x, width);
}

// The vector part of a row's full windows: returns how many pixels it wrote, none where there is no
// vector path. `sum` moves on with them.
template <typename Sum, typename RowSum>
inline int mean_windows(const Sum*, const Sum*, uint8_t*, int, RowSum&, int) {
  return 0;
}

#if HAZE_NEON
inline int mean_windows(const int16_t* entering, const int16_t* leaving, uint8_t* dst, int pixels,
                        int32_t& sum, int rows) {
  // 16 bits hold the column sums of the 64 x 64 mean alone.
  return mean_windows_64_neon(entering, leaving, dst, pixels, sum, rows);
}
#endif

// Means of one output row: dst[x] = divide(sum of the column sums in the window of x, rows,
// columns). The window grows at the left border, keeps its width in the middle and shrinks at the
// right one. Needs width >= before + after + 1.
template <typename RowSum, typename Sum, typename Divide>
inline void mean_row(const Sum* sums, uint8_t* dst, int width, Reach reach, int rows,
                     Divide divide) {
  const Sum* const entering = sums + reach.after;
  const Sum* const leaving = sums - reach.before - 1;
  const int window = reach.before + reach.after + 1;
  RowSum sum = 0;
  for (int x = 0; x < reach.after; ++x) sum += sums[x];
  int x = 0;
  for (; x <= reach.before; ++x) {
    sum += entering[x];
    dst[x] = divide(sum, rows, reach.after + 1 + x);
  }
  const int right = width - reach.after;
  x += mean_windows(entering + x, leaving + x, dst + x, right - x, sum, rows);
  for (; x < right; ++x) {
    sum += entering[x];
    sum -= leaving[x];
    dst[x] = divide(sum, rows, window);
  }
  for (; x < width; ++x) {
    sum -= leaving[x];
    dst[x] = divide(sum, rows, width - x + reach.before);
  }
}

// Slides the column sums of a window down the image and hands each output row over:
// row(y, rows of its window). `sums` ends with those of the last row's window. Needs height >=
// before + after + 1, so in every step a row enters or leaves.
template <typename Sum, typename Row>
inline void sweep_columns(const uint8_t* src, int width, int height, Reach reach, Sum* sums,
                          Row row) {
  const auto source_row = [=](int y) { return src + static_cast<ptrdiff_t>(y) * width; };
  start_columns(sums, src, width);
  for (int y = 1; y < reach.after; ++y) add_row(sums, source_row(y), width);
  for (int y = 0; y < height; ++y) {
    const int entering = y + reach.after;
    const int leaving = y - reach.before - 1;
    if (leaving < 0)
      add_row(sums, source_row(entering), width);
    else if (entering < height)
      slide_rows(sums, source_row(entering), source_row(leaving), width);
    else
      subtract_row(sums, source_row(leaving), width);
    row(y, window_count(y, reach, height));
  }
}

}  // namespace haze::filter
