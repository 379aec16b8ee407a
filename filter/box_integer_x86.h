// Vector paths of the integer box filters for x86-64, by vector type.
#pragma once

#include <stdint.h>

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

// Means of windows that move on by one column per pixel: `sum` is the window's before the first of
// them; entering[x] and leaving[x] are the column sums that pixel x adds and drops. Returns the
// first pixel that it did not write, and leaves the sum of the pixel before it.
//
// Exact for sums below 2^24 and counts up to 2^16, see divide_small in box_integer.cpp.
template <typename V, typename Sum>
int mean_windows_x86(const Sum* entering, const Sum* leaving, uint8_t* dst, int pixels,
                     int32_t& sum, int count) {
  const typename V::Float divisor = V::set_float(static_cast<float>(count));
  typename V::Int carried = V::set32(sum);
  int x = 0;
  for (; x + V::kFloats <= pixels; x += V::kFloats) {
    const typename V::Int changes = V::sub32(V::load32(entering + x), V::load32(leaving + x));
    const typename V::Int sums = V::add32(V::running_sums32(changes), carried);
    carried = V::repeat_last32(sums);
    V::store_low_bytes32(dst + x, V::truncate(V::div(V::to_float(sums), divisor)));
  }
  sum = V::first32(carried);
  return x;
}

}  // namespace haze::filter
