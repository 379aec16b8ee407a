// Vector paths of the float box filters for x86-64, by vector type.
#pragma once

#include <stddef.h>

#include "filter/box_float_step.h"

namespace haze::filter {

// kFloats neighbouring values of a row of a plane or of a product.
template <typename V, bool kProduct>
typename V::Float row_values(RowPointers row, ptrdiff_t x) {
  if constexpr (kProduct)
    return V::mul(V::load_floats(row.first + x), V::load_floats(row.second + x));
  return V::load_floats(row.first + x);
}

template <typename V, bool kProduct, ColumnStep kStep>
ptrdiff_t next_sums_of(const float* above, float* sums, RowPointers entering, RowPointers leaving,
                       ptrdiff_t width) {
  using Float = typename V::Float;
  ptrdiff_t x = 0;
  for (; x + V::kFloats <= width; x += V::kFloats) {
    const Float sum = V::load_floats(above + x);
    if constexpr (kStep == ColumnStep::kEnter)
      V::store_floats(sums + x, V::add(sum, row_values<V, kProduct>(entering, x)));
    else if constexpr (kStep == ColumnStep::kLeave)
      V::store_floats(sums + x, V::sub(sum, row_values<V, kProduct>(leaving, x)));
    else
      V::store_floats(sums + x, V::add(sum, V::sub(row_values<V, kProduct>(entering, x),
                                                   row_values<V, kProduct>(leaving, x))));
  }
  return x;
}

// As the portable column steps; returns the first column that it did not write.
template <typename V, bool kProduct>
ptrdiff_t next_sums_x86(ColumnStep step, const float* above, float* sums, RowPointers entering,
                        RowPointers leaving, ptrdiff_t width) {
  switch (step) {
    case ColumnStep::kEnter:
      return next_sums_of<V, kProduct, ColumnStep::kEnter>(above, sums, entering, leaving, width);
    case ColumnStep::kLeave:
      return next_sums_of<V, kProduct, ColumnStep::kLeave>(above, sums, entering, leaving, width);
    case ColumnStep::kSlide:
      return next_sums_of<V, kProduct, ColumnStep::kSlide>(above, sums, entering, leaving, width);
  }
  return 0;
}

// values[x] /= divisor; returns the first value that it did not divide.
template <typename V>
int divide_by_x86(float* values, int count, float divisor) {
  int x = 0;
  for (; x + V::kFloats <= count; x += V::kFloats)
    V::store_floats(values + x, V::div(V::load_floats(values + x), V::set_float(divisor)));
  return x;
}

}  // namespace haze::filter
