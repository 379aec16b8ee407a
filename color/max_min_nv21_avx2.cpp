#include "color/max_min_nv21_x86.h"
#include "core/simd_avx2.h"

namespace haze::color {

int max_min_row_avx2(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out, uint8_t* max_out,
                     int end) {
  return max_min_row_x86<Avx2>(luma, chroma, min_out, max_out, end);
}

}  // namespace haze::color
