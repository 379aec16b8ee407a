// Vector paths of the guided filter's pixel-wise steps for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

namespace haze::filter {

// As fit_model_portable; returns the first pixel that it did not write.
template <typename V>
size_t fit_model_x86(const float* mean_guide, const float* mean_plane, float* products,
                     float* squares, float epsilon, size_t end) {
  using Float = typename V::Float;
  size_t i = 0;
  for (; i + V::kFloats <= end; i += V::kFloats) {
    const Float guide = V::load_floats(mean_guide + i);
    const Float plane = V::load_floats(mean_plane + i);
    const Float covariance = V::sub(V::load_floats(products + i), V::mul(guide, plane));
    const Float variance = V::sub(V::load_floats(squares + i), V::mul(guide, guide));
    // The slope comes second: it is handed on where it is not a number.
    const Float slope = V::min(V::set_float(1.0f), V::wide_quotient(V::size_of(covariance),
                                                                    V::size_of(variance), epsilon));
    V::store_floats(squares + i, V::sub(plane, V::mul(slope, guide)));
    V::store_floats(products + i, slope);
  }
  return i;
}

// As refined_codes_portable; returns the first pixel that it did not write.
//
// A value above 0.99 has a code of at least 158 in single precision, so cutting the code is the
// same as looking at the value. The second operands are handed on where one is not a number.
template <typename V>
size_t refined_codes_x86(const float* guide, const float* mean_slopes, const float* mean_offsets,
                         uint8_t* codes, size_t end) {
  using Float = typename V::Float;
  size_t i = 0;
  for (; i + V::kBytes <= end; i += V::kBytes) {
    typename V::Int quarters[4];
    for (size_t q = 0; q < 4; ++q) {
      const size_t at = i + q * V::kFloats;
      const Float own = V::load_floats(guide + at);
      const Float refined =
          V::add(V::load_floats(mean_offsets + at), V::mul(own, V::load_floats(mean_slopes + at)));
      const Float value = V::max(refined, own);
      const Float code = V::sub(V::mul(V::set_float(200.0f), value), V::set_float(40.0f));
      quarters[q] = V::truncate(V::max(V::set_float(0.0f), V::min(V::set_float(158.0f), code)));
    }
    V::store(codes + i, V::clamp32(quarters));
  }
  return i;
}

}  // namespace haze::filter
