// Row kernels of the float box filters.
//
// Running sums in floating point round at every step, so the order of additions is part of the
// result. Columns are independent of each other in the vertical sums, which is where vectors help;
// the horizontal sum of a row is one chain.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/target.h"

namespace haze::filter {

// The quantities that are averaged, by pixel index. `four` gives four neighbouring pixels.
struct PlaneTerm {
  const float* plane;

  PlaneTerm from(ptrdiff_t offset) const { return {plane + offset}; }
  float operator()(ptrdiff_t i) const { return plane[i]; }
#if HAZE_NEON
  float32x4_t four(ptrdiff_t i) const { return vld1q_f32(plane + i); }
#endif
};

struct ProductTerm {
  const float* first;
  const float* second;

  ProductTerm from(ptrdiff_t offset) const { return {first + offset, second + offset}; }
  float operator()(ptrdiff_t i) const { return first[i] * second[i]; }
#if HAZE_NEON
  float32x4_t four(ptrdiff_t i) const {
    return vmulq_f32(vld1q_f32(first + i), vld1q_f32(second + i));
  }
#endif
};

// sums[x] = row(x).
template <typename Term>
inline void start_columns_portable(float* sums, Term row, ptrdiff_t begin, ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] = row(x);
}

// sums[x] += row(x): a row enters the window.
template <typename Term>
inline void add_row_portable(float* sums, Term row, ptrdiff_t begin, ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] += row(x);
}

// sums[x] -= row(x): a row leaves it.
template <typename Term>
inline void subtract_row_portable(float* sums, Term row, ptrdiff_t begin, ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] -= row(x);
}

// A row enters and another leaves. The difference is formed first.
template <typename Term>
inline void slide_rows_portable(float* sums, Term entering, Term leaving, ptrdiff_t begin,
                                ptrdiff_t end) {
  for (ptrdiff_t x = begin; x < end; ++x) sums[x] += entering(x) - leaving(x);
}

#if HAZE_NEON
// The same for whole steps of four; each returns the first column that it did not touch. Compilers
// leave float loops scalar on 32-bit ARM, since NEON takes numbers below the normal range as zero.
template <typename Term>
inline ptrdiff_t start_columns_neon(float* sums, Term row, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) vst1q_f32(sums + x, row.four(x));
  return x;
}

template <typename Term>
inline ptrdiff_t add_row_neon(float* sums, Term row, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) vst1q_f32(sums + x, vaddq_f32(vld1q_f32(sums + x), row.four(x)));
  return x;
}

template <typename Term>
inline ptrdiff_t subtract_row_neon(float* sums, Term row, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) vst1q_f32(sums + x, vsubq_f32(vld1q_f32(sums + x), row.four(x)));
  return x;
}

template <typename Term>
inline ptrdiff_t slide_rows_neon(float* sums, Term entering, Term leaving, ptrdiff_t end) {
  ptrdiff_t x = 0;
  for (; x + 4 <= end; x += 4) {
    const float32x4_t change = vsubq_f32(entering.four(x), leaving.four(x));
    vst1q_f32(sums + x, vaddq_f32(vld1q_f32(sums + x), change));
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
inline void add_row(float* sums, Term row, ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = add_row_neon(sums, row, width);
#endif
  add_row_portable(sums, row, x, width);
}

template <typename Term>
inline void subtract_row(float* sums, Term row, ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = subtract_row_neon(sums, row, width);
#endif
  subtract_row_portable(sums, row, x, width);
}

template <typename Term>
inline void slide_rows(float* sums, Term entering, Term leaving, ptrdiff_t width) {
  ptrdiff_t x = 0;
#if HAZE_NEON
  x = slide_rows_neon(sums, entering, leaving, width);
#endif
  slide_rows_portable(sums, entering, leaving, x, width);
}

// Means of one output row from its column sums; `rows` is the number of rows in the window. The
// count grows at the left border, stays in the middle and shrinks at the right one. Needs width >=
// 2 * radius + 1.
inline void mean_row_float(const float* sums, float* dst, int width, int radius, float rows) {
  float sum = sums[0];
  float count = static_cast<float>(radius) * rows;
  for (int x = 1; x < radius; ++x) sum += sums[x];
  int x = 0;
  for (; x <= radius; ++x) {
    sum += sums[x + radius];
    count += rows;
    dst[x] = sum / count;
  }
  // Sums first and quotients afterwards, so that the divisions can go side by side.
  const int right = width - radius;
  for (; x < right; ++x) {
    sum += sums[x + radius] - sums[x - radius - 1];
    dst[x] = sum;
  }
  count = static_cast<float>(2 * radius + 1) * rows;
  for (int middle = radius + 1; middle < right; ++middle) dst[middle] /= count;
  for (; x < width; ++x) {
    sum -= sums[x - radius - 1];
    count -= rows;
    dst[x] = sum / count;
  }
}

}  // namespace haze::filter
