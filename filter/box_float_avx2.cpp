#include "core/simd_avx2.h"
#include "filter/box_float_x86.h"

namespace haze::filter {

ptrdiff_t next_sums_of_plane_avx2(ColumnStep step, const float* above, float* sums,
                                  RowPointers entering, RowPointers leaving, ptrdiff_t width) {
  return next_sums_x86<Avx2, false>(step, above, sums, entering, leaving, width);
}

ptrdiff_t next_sums_of_product_avx2(ColumnStep step, const float* above, float* sums,
                                    RowPointers entering, RowPointers leaving, ptrdiff_t width) {
  return next_sums_x86<Avx2, true>(step, above, sums, entering, leaving, width);
}

int divide_by_avx2(float* values, int count, float divisor) {
  return divide_by_x86<Avx2>(values, count, divisor);
}

}  // namespace haze::filter
