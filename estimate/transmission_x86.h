// Vector path of the transmission map for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "estimate/transmission_code.h"

namespace haze::estimate {

// As group_codes_portable with the pixels' own minima; returns the first pixel that it did not
// write.
//
// Of two operands of which one is not a number min and max give the second, which here is the value
// that is handed on; truncated it is the least integer, which clamps to code 0.
template <typename V>
size_t group_codes_x86(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                       float strength, float minus_inv_a) {
  using Float = typename V::Float;
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    typename V::Int quarters[4];
    for (size_t q = 0; q < 4; ++q) {
      const Float bound = V::load_bytes(minimum + i + q * V::kFloats);
      const Float scaled = V::mul(V::load_bytes(mean + i + q * V::kFloats), V::set_float(strength));
      const Float least = V::min(bound, scaled);
      Float t = V::add(V::set_float(1.0f), V::mul(least, V::set_float(minus_inv_a)));
      t = V::max(V::set_float(kLeastTransmission), t);
      t = V::min(V::set_float(kMostTransmission), t);
      quarters[q] =
          V::truncate(V::add(V::set_float(-kCodeOffset), V::mul(t, V::set_float(kCodeScale))));
    }
    V::store(codes + i, V::clamp32(quarters));
  }
  return i;
}

// As look_up_codes_portable; returns the first pixel that it did not write.
template <typename V>
size_t look_up_codes_x86(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                         const uint8_t* of_mean, const uint8_t* of_minimum) {
  const typename V::Table mean_table(of_mean);
  const typename V::Table minimum_table(of_minimum);
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    V::store(codes + i,
             V::max8u(mean_table[V::load(mean + i)], minimum_table[V::load(minimum + i)]));
  }
  return i;
}

}  // namespace haze::estimate
