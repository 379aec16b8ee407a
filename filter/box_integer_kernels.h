// Row kernels of the integer box filters: column sums that slide down the image, and the means of
// one output row taken from them.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/target.h"
#include "filter/box_integer_neon.h"
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
  int x = 0;
#if HAZE_NEON
  x = add_row_neon(sums, row, width);
#endif
  for (; x < width; ++x) sums[x] = static_cast<Sum>(sums[x] + row[x]);
}

// sums[x] -= row[x]: a row leaves it.
template <typename Sum>
inline void subtract_row(Sum* sums, const uint8_t* row, int width) {
  int x = 0;
#if HAZE_NEON
  x = subtract_row_neon(sums, row, width);
#endif
  for (; x < width; ++x) sums[x] = static_cast<Sum>(sums[x] - row[x]);
}

// A row enters and another leaves, columns [begin, end).
template <typename Sum>
inline void slide_rows_portable(Sum* sums, const uint8_t* entering, const uint8_t* leaving,
                                int begin, int end) {
  for (int x = begin; x < end; ++x)
    sums[x] = static_cast<Sum>(sums[x] + (entering[x] - leaving[x]));
}

#if HAZE_X86
// Same sums; each returns the first column that it did not touch.
int slide_rows_avx2(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width);
int slide_rows_avx512(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width);

// Means of one output row whose windows hold `rows` rows, into row.means.
void mean_row_avx2(PrefixRow& row, int rows);
void mean_row_avx512(PrefixRow& row, int rows);
#endif

inline void slide_rows(int32_t* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  int x = 0;
#if HAZE_NEON
  x = slide_rows_neon(sums, entering, leaving, width);
#endif
  slide_rows_portable(sums, entering, leaving, x, width);
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
                        int32_t& sum, int count) {
  // 16 bits hold the column sums of the 64 x 64 mean alone.
  return mean_windows_64_neon(entering, leaving, dst, pixels, sum, count / 64);
}

inline int mean_windows(const int32_t* entering, const int32_t* leaving, uint8_t* dst, int pixels,
                        int32_t& sum, int count) {
  return mean_windows_32_neon(entering, leaving, dst, pixels, sum, count);
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
  x += mean_windows(entering + x, leaving + x, dst + x, right - x, sum, rows * window);
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
