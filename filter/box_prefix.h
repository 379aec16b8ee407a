// Window sums of a row as differences of prefix sums: the x86 way of the integer box filters.
#pragma once

#include <stdint.h>

#include "core/numeric.h"
#include "filter/reach.h"

namespace haze::filter {

// Working memory for rows of one width and one window, small enough for the stack. Column sums are
// padded with zeros on both sides, so the windows that the border cuts are summed like all others:
// with P[k] the sum of the padded sums before k, the window of column x holds
// P[x + front + after + 1] - P[x + front - before].
//
// Range: column sums of at most 128 rows are below 2^15, prefix sums below 2^28.
struct PrefixRow {
  static constexpr int kMaxWidth = 4096;
  static constexpr int kMaxRows = 128;
  static constexpr int kMaxReach = 64;
  static constexpr int kStep = 32;  // the most columns that a kernel takes at once

  static bool fits(int width, Reach reach) {
    return width <= kMaxWidth && max(reach.before, reach.after) <= kMaxReach &&
           reach.before + reach.after + 1 <= kMaxRows;
  }

  PrefixRow(int row_width, Reach reach) : width(row_width) {
    const int front = (reach.before + 1) & ~1;
    const int padded = front + width + reach.after + 1 + kStep;
    pairs = (padded + kStep - 1) / kStep * kStep / 2;
    for (int x = 0; x < 2 * pairs; ++x) sums[x] = 0;
    column_sums = sums + front;
    for (int i = 0; 2 * i < width + kStep; ++i) {
      even_columns[i] = static_cast<float>(max(1, window_count(2 * i, reach, width)));
      odd_columns[i] = static_cast<float>(max(1, window_count(2 * i + 1, reach, width)));
    }
    after_even = prefixes(front + reach.after + 1);
    after_odd = prefixes(front + reach.after + 2);
    before_even = prefixes(front - reach.before);
    before_odd = prefixes(front - reach.before + 1);
  }
  PrefixRow(const PrefixRow&) = delete;
  PrefixRow& operator=(const PrefixRow&) = delete;

  // P[k], P[k + 2], P[k + 4] ...
  const int32_t* prefixes(int k) const { return (k % 2 == 0 ? even : odd) + k / 2; }

  int width;
  int pairs;             // half the length of `sums` in use, a multiple of kStep / 2
  int16_t* column_sums;  // of the row's columns, within `sums`
  const int32_t* after_even;
  const int32_t* after_odd;
  const int32_t* before_even;
  const int32_t* before_odd;

 private:
  static constexpr int kMaxPadded = kMaxWidth + 2 * kMaxReach + 3 * kStep;

 public:
  int16_t sums[kMaxPadded];
  int32_t even[kMaxPadded / 2];  // P[2 i]
  int32_t odd[kMaxPadded / 2];   // P[2 i + 1]
  // Columns in the windows of the columns 2 i and 2 i + 1.
  float even_columns[(kMaxWidth + kStep) / 2 + 1];
  float odd_columns[(kMaxWidth + kStep) / 2 + 1];
  uint8_t means[kMaxWidth + kStep];
};

}  // namespace haze::filter
