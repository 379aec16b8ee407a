// Row kernels of the float box filters.
//
// Running sums in floating point round at every step, so the order of additions is part of the
// result. Columns are independent of each other in the vertical sums, which is where vectors help;
// the horizontal sum of a row is one chain.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "core/target.h"
#include "filter/box_float_step.h"

namespace haze::filter {

#if HAZE_X86
// The vector part of a step of the column sums; each returns the first column that it did not
// write.
ptrdiff_t next_sums_of_plane_avx2(ColumnStep step, const float* above, float* sums,
                                  RowPointers entering, RowPointers leaving, ptrdiff_t width);
ptrdiff_t next_sums_of_plane_avx512(ColumnStep step, const float* above, float* sums,
                                    RowPointers entering, RowPointers leaving, ptrdiff_t width);
ptrdiff_t next_sums_of_product_avx2(ColumnStep step, const float* above, float* sums,
                                    RowPointers entering, RowPointers leaving, ptrdiff_t width);
ptrdiff_t next_sums_of_product_avx512(ColumnStep step, const float* above, float* sums,
                                      RowPointers entering, RowPointers leaving, ptrdiff_t width);
// values[x] /= divisor; each returns the first value that it did not divide.
int divide_by_avx2(float* values, int count, float divisor);
int divide_by_avx512(float* values, int count, float divisor);
#endif

// The quantities that are averaged, by pixel index. `four` gives four neighbouring pixels.
struct PlaneTerm {
  const float* plane;

  PlaneTerm from(ptrdiff_t offset) const { return {plane + offset}; }
  RowPointers pointers() const { return {plane, nullptr}; }
#if HAZE_X86
  static auto* x86() { return x86_kernel(next_sums_of_plane_avx2, next_sums_of_plane_avx512); }
#endif
  float operator()(ptrdiff_t i) const { return plane[i]; }
#if HAZE_NEON
  float32x4_t four(ptrdiff_t i) const { return vld1q_f32(plane + i); }
#endif
};

struct ProductTerm {
  const float* first;
  const float* second;

  ProductTerm from(ptrdiff_t offset) const { return {first + offset, second + offset}; }
  RowPointers pointers() const { return {first, second}; }
#if HAZE_X86
  static auto* x86() { return x86_kernel(next_sums_of_product_avx2, next_sums_of_product_avx512); }
#endif
  float operator()(ptrdiff_t i) const { return first[i] * second[i]; }
#if HAZE_NEON
  float32x4_t four(ptrdiff_t i) const {
    return vmulq_f32(vld1q_f32(first + i), vld1q_f32(second + i));
  }
#endif
};

// One row of column sums from the one above, columns [begin, end).
//
// sums[x] = row(x), for the first row
template <typename Term>
inline void start_columns_portable(float* sums, Term row, ptrdiff_t begin, ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] = row(x);
}

// sums[x] = above[x] + row(x): a row enters the window.
template <typename Term>
inline void add_row_portable(const float* above, float* sums, Term row, ptrdiff_t begin,
                             ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] = above[x] + row(x);
}

// sums[x] = above[x] - row(x): a row leaves it.
template <typename Term>
inline void subtract_row_portable(const float* above, float* sums, Term row, ptrdiff_t begin,
                                  ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] = above[x] - row(x);
}

// A row enters and another leaves. Their difference is formed first.
template <typename Term>
inline void slide_rows_portable(const float* above, float* sums, Term entering, Term leaving,
                                ptrdiff_t begin, ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] = above[x] + (entering(x) - leaving(x));
}

#if HAZE_NEON
// The same for whole steps of four; each returns the first column that it did not write. Compilers
// leave float loops scalar on 32-bit ARM, since NEON takes numbers below the normal range as zero.
template <typename Term>
inline ptrdiff_t start_columns_neon(float* sums, Term row, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) vst1q_f32(sums + x, row.four(x));
  return x;
}

template <typename Term>
inline ptrdiff_t add_row_neon(const float* above, float* sums, Term row, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) vst1q_f32(sums + x, vaddq_f32(vld1q_f32(above + x), row.four(x)));
  return x;
}

template <typename Term>
inline ptrdiff_t subtract_row_neon(const float* above, float* sums, Term row, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) vst1q_f32(sums + x, vsubq_f32(vld1q_f32(above + x), row.four(x)));
  return x;
}

template <typename Term>
inline ptrdiff_t slide_rows_neon(const float* above, float* sums, Term entering, Term leaving,
                                 ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) {
    const float32x4_t change = vsubq_f32(entering.four(x), leaving.four(x));
    vst1q_f32(sums + x, vaddq_f32(vld1q_f32(above + x), change));
  }
  return x;
}
#endif

template <typename Term>
inline void start_columns(float* sums, Term row, ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = start_columns_neon(sums, row, width);
#endif
  start_columns_portable(sums, row, x, width);
}

template <typename Term>
inline void add_row(const float* above, float* sums, Term row, ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = add_row_neon(above, sums, row, width);
#elif HAZE_X86
  if (const auto kernel = Term::x86())
    x = kernel(ColumnStep::kEnter, above, sums, row.pointers(), {}, width);
#endif
  add_row_portable(above, sums, row, x, width);
}

template <typename Term>
inline void subtract_row(const float* above, float* sums, Term row, ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = subtract_row_neon(above, sums, row, width);
#elif HAZE_X86
  if (const auto kernel = Term::x86())
    x = kernel(ColumnStep::kLeave, above, sums, {}, row.pointers(), width);
#endif
  subtract_row_portable(above, sums, row, x, width);
}

template <typename Term>
inline void slide_rows(const float* above, float* sums, Term entering, Term leaving,
                       ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = slide_rows_neon(above, sums, entering, leaving, width);
#elif HAZE_X86
  if (const auto kernel = Term::x86())
    x = kernel(ColumnStep::kSlide, above, sums, entering.pointers(), leaving.pointers(), width);
#endif
  slide_rows_portable(above, sums, entering, leaving, x, width);
}

// values[x] /= divisor
inline void divide_by(float* values, int count, float divisor) {
  int x = 0;
#if HAZE_X86
  if (const auto kernel = x86_kernel(divide_by_avx2, divide_by_avx512))
    x = kernel(values, count, divisor);
#endif
  for (; x < count; ++x) values[x] /= divisor;
}

// kRows neighbouring output rows: their column sums, their means, and how many rows each of their
// windows has.
template <int kRows>
struct RowGroup {
  const float* sums[kRows];
  float* dst[kRows];
  float rows[kRows];
};

// Means of a group of output rows from their column sums. The count of pixels grows at the left
// border, stays in the middle and shrinks at the right one. Needs width >= 2 * radius + 1.
template <int kRows>
inline void mean_rows(const RowGroup<kRows>& group, int width, int radius) {
  float sum[kRows];
  float count[kRows];
  for (int k = 0; k < kRows; ++k) {
    sum[k] = group.sums[k][0];
    for (int x = 1; x < radius; ++x) sum[k] += group.sums[k][x];
    count[k] = static_cast<float>(radius) * group.rows[k];
  }
  int x = 0;
  for (; x <= radius; ++x) {
    for (int k = 0; k < kRows; ++k) {
      sum[k] += group.sums[k][x + radius];
      count[k] += group.rows[k];
      group.dst[k][x] = sum[k] / count[k];
    }
  }
  // Sums first and quotients afterwards, so that divisions by one count can go side by side.
  const int right = width - radius;
  for (; x < right; ++x) {
    for (int k = 0; k < kRows; ++k) {
      sum[k] += group.sums[k][x + radius] - group.sums[k][x - radius - 1];
      group.dst[k][x] = sum[k];
    }
  }
  for (int k = 0; k < kRows; ++k) {
    count[k] = static_cast<float>(2 * radius + 1) * group.rows[k];
    divide_by(group.dst[k] + radius + 1, right - radius - 1, count[k]);
  }
  for (; x < width; ++x) {
    for (int k = 0; k < kRows; ++k) {
      sum[k] -= group.sums[k][x - radius - 1];
      count[k] -= group.rows[k];
      group.dst[k][x] = sum[k] / count[k];
    }
  }
}

}  // namespace haze::filter
