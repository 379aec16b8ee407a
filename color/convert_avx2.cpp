#include "color/convert_x86.h"
#include "core/simd_avx2.h"

namespace haze::color {

int half_bgr_row_avx2(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int end) {
  return half_bgr_row_x86<Avx2>(luma, vu, bgr, end);
}

size_t ycrcb_to_bgr_avx2(const uint8_t* ycrcb, uint8_t* bgr, size_t end) {
  return ycrcb_to_bgr_x86<Avx2>(ycrcb, bgr, end);
}

size_t bgr_to_ycrcb_avx2(const uint8_t* bgr, uint8_t* ycrcb, size_t end) {
  return bgr_to_ycrcb_x86<Avx2>(bgr, ycrcb, end);
}

}  // namespace haze::color
