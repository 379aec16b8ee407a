// Vector paths of the minimum and maximum filters for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

namespace haze::filter {

// As combine_lines; both return the first sample that they did not write.
template <typename V>
size_t combine_least_bytes_x86(const uint8_t* earlier, const uint8_t* later, uint8_t* to,
                               size_t count) {
  size_t i = 0;
  for (; i + V::kBytes <= count; i += V::kBytes)
    V::store(to + i, V::min8u(V::load(earlier + i), V::load(later + i)));
  return i;
}

template <typename V>
size_t combine_most_floats_x86(const float* earlier, const float* later, float* to, size_t count) {
  size_t i = 0;
  for (; i + V::kFloats <= count; i += V::kFloats)
    V::store_floats(to + i, V::max(V::load_floats(earlier + i), V::load_floats(later + i)));
  return i;
}

}  // namespace haze::filter
