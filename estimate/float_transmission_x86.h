// Vector path of the per-pixel float transmission for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

namespace haze::estimate {

// t[i] = max over the channels of clamp(1 - scales[c] * pixels[3 i + c]), clamp to [least, 1];
// returns the first pixel that it did not write.
template <typename V>
size_t largest_transmissions_x86(const uint8_t* pixels, const float* scales, float least, float* t,
                                 size_t end) {
  using Float = typename V::Float;
  const Float one = V::set_float(1.0f);
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    typename V::Int channels[3];
    V::load_three(pixels + 3 * i, channels);
    uint8_t bytes[3][V::kBytes];
    for (int c = 0; c < 3; ++c) V::store(bytes[c], channels[c]);
    for (int first = 0; first < V::kBytes; first += V::kFloats) {
      Float largest[3];
      for (int c = 0; c < 3; ++c) {
        const Float raw =
            V::sub(one, V::mul(V::set_float(scales[c]), V::load_bytes(bytes[c] + first)));
        largest[c] = V::min(one, V::max(V::set_float(least), raw));
      }
      V::store_floats(t + i + first, V::max(largest[2], V::max(largest[1], largest[0])));
    }
  }
  return i;
}

}  // namespace haze::estimate
