#include "core/simd_avx512.h"
#include "filter/box_integer_x86.h"

namespace haze::filter {

int slide_rows_avx512(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  return slide_rows_x86<Avx512>(sums, entering, leaving, width);
}

int mean_windows_16_avx512(const int16_t* entering, const int16_t* leaving, uint8_t* dst,
                           int pixels, int32_t& sum, int count) {
  return mean_windows_x86<Avx512>(entering, leaving, dst, pixels, sum, count);
}

int mean_windows_32_avx512(const int32_t* entering, const int32_t* leaving, uint8_t* dst,
                           int pixels, int32_t& sum, int count) {
  return mean_windows_x86<Avx512>(entering, leaving, dst, pixels, sum, count);
}

}  // namespace haze::filter
