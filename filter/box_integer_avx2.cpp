#include "core/simd_avx2.h"
#include "filter/box_integer_x86.h"

namespace haze::filter {

int slide_rows_avx2(int16_t* sums, const uint8_t* entering, const uint8_t* leaving, int width) {
  return slide_rows_x86<Avx2>(sums, entering, leaving, width);
}

void mean_row_avx2(PrefixRow& row, int rows) { mean_row_x86<Avx2>(row, rows); }

}  // namespace haze::filter
