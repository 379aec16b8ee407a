#include "core/simd_avx2.h"
#include "filter/window_extremum_x86.h"

namespace haze::filter {

size_t combine_least_bytes_avx2(const uint8_t* earlier, const uint8_t* later, uint8_t* to,
                                size_t count) {
  return combine_least_bytes_x86<Avx2>(earlier, later, to, count);
}

size_t combine_most_floats_avx2(const float* earlier, const float* later, float* to, size_t count) {
  return combine_most_floats_x86<Avx2>(earlier, later, to, count);
}

}  // namespace haze::filter
