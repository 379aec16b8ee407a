// Row kernels of the integer box filters: column sums that slide down the image, and the means of
// one output row taken from them.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/numeric.h"

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

// A row enters and another leaves.
template <typename Sum>
inline void slide_rows(Sum* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  for (int x = 0; x < width; ++x) sums[x] = static_cast<Sum>(sums[x] + (entering[x] - leaving[x]));
}

// How far a window reaches from its centre: rows y - before ... y + after, columns likewise.
struct Reach {
  int before;
  int after;
};

// Pixels of a window centred on `position` that lie in 0 ... size - 1.
constexpr int window_count(int position, Reach reach, int size) {
  return min(position + reach.after, size - 1) - max(position - reach.before, 0) + 1;
}

// Means of one output row: dst[x] = quotient(sum of column sums in the window of x, its columns).
// The window grows at the left border, keeps its width in the middle and shrinks at the right one.
// `edge` divides for a count of columns, `full` for the full width. Needs width >= before + after
// + 1.
template <typename RowSum, typename Sum, typename Edge, typename Full>
inline void mean_row(const Sum* sums, uint8_t* dst, int width, Reach reach, Edge edge, Full full) {
  RowSum sum = 0;
  for (int x = 0; x < reach.after; ++x) sum += static_cast<RowSum>(sums[x]);
  int x = 0;
  for (; x <= reach.before; ++x) {
    sum += static_cast<RowSum>(sums[x + reach.after]);
    dst[x] = edge(sum, reach.after + 1 + x);
  }
  for (; x < width - reach.after; ++x) {
    sum += static_cast<RowSum>(sums[x + reach.after]);
    sum -= static_cast<RowSum>(sums[x - reach.before - 1]);
    dst[x] = full(sum);
  }
  for (; x < width; ++x) {
    sum -= static_cast<RowSum>(sums[x - reach.before - 1]);
    dst[x] = edge(sum, width - x + reach.before);
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
