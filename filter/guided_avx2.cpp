#include "core/simd_avx2.h"
#include "filter/guided_x86.h"

namespace haze::filter {

size_t fit_model_avx2(const float* mean_guide, const float* mean_plane, float* products,
                      float* squares, float epsilon, size_t end) {
  return fit_model_x86<Avx2>(mean_guide, mean_plane, products, squares, epsilon, end);
}

size_t refined_codes_avx2(const float* guide, const float* mean_slopes, const float* mean_offsets,
                          uint8_t* codes, size_t end) {
  return refined_codes_x86<Avx2>(guide, mean_slopes, mean_offsets, codes, end);
}

}  // namespace haze::filter
