// Vector paths of the integer box filters for x86-64, by vector type.
#pragma once

#include <stdint.h>

#include "filter/box_prefix.h"

namespace haze::filter {

// As slide_rows for 16-bit sums; returns the first column that it did not touch.
template <typename V>
int slide_rows_x86(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  constexpr int kStep = V::kBytes / 2;
  int x = 0;
  for (; x + kStep <= width; x += kStep) {
    const typename V::Int change =
        V::sub16(V::load_bytes16(entering + x), V::load_bytes16(leaving + x));
    V::store(sums + x, V::add16(V::load(sums + x), change));
  }
  return x;
}

// Prefix sums of the padded column sums. Neighbours are added in pairs first, which halves the work
// of the running sum over the lanes.
template <typename V>
void sum_prefixes_x86(PrefixRow& row) {
  using Int = typename V::Int;
  const Int ones = V::set16(1);
  const Int low_halves = V::set32(0xFFFF);
  Int carried = V::set32(0);
  for (int pair = 0; pair < row.pairs; pair += V::kFloats) {
    const Int sums = V::load(row.sums + 2 * pair);
    const Int pair_sums = V::sum_of_products16(sums, ones);
    const Int running = V::running_sums32(pair_sums);
    const Int even = V::add32(V::sub32(running, pair_sums), carried);
    V::store(row.even + pair, even);
    V::store(row.odd + pair, V::add32(even, V::bit_and(sums, low_halves)));
    carried = V::add32(carried, V::repeat_last32(running));
  }
}

// Means of one output row whose windows hold `rows` rows. Writes whole vectors: up to V::kBytes / 2
// - 1 bytes past the row's end, into row.means.
template <typename V>
void mean_row_x86(PrefixRow& row, int rows) {
  using Int = typename V::Int;
  sum_prefixes_x86<V>(row);
  const typename V::Float row_count = V::set_float(static_cast<float>(rows));
  const auto mean = [&](const int32_t* after, const int32_t* before, const float* columns) {
    const Int sum = V::sub32(V::load(after), V::load(before));
    return V::truncate(V::div(V::to_float(sum), V::mul(row_count, V::load_floats(columns))));
  };
  for (int i = 0; 2 * i < row.width; i += V::kFloats) {
    const Int even = mean(row.after_even + i, row.before_even + i, row.even_columns + i);
    const Int odd = mean(row.after_odd + i, row.before_odd + i, row.odd_columns + i);
    V::store_low_halves32(row.means + 2 * i, V::bit_or(even, V::template shift_left32<8>(odd)));
  }
}

}  // namespace haze::filter
