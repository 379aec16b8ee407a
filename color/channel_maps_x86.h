// Vector paths of the channel maps for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

namespace haze::color {

// As min_map_portable and min_max_maps_portable; both return the first pixel that they did not
// write.
template <typename V>
size_t min_map_x86(const uint8_t* pixels, uint8_t* min_map, size_t end) {
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    typename V::Int c[3];
    V::load_three(pixels + 3 * i, c);
    V::store(min_map + i, V::min8u(V::min8u(c[0], c[1]), c[2]));
  }
  return i;
}

template <typename V>
size_t min_max_maps_x86(const uint8_t* pixels, uint8_t* min_map, uint8_t* max_map, size_t end) {
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    typename V::Int c[3];
    V::load_three(pixels + 3 * i, c);
    V::store(min_map + i, V::min8u(V::min8u(c[0], c[1]), c[2]));
    V::store(max_map + i, V::max8u(V::max8u(c[0], c[1]), c[2]));
  }
  return i;
}

}  // namespace haze::color
