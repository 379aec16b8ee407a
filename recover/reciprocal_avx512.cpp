#include "core/simd_avx512.h"
#include "recover/reciprocal_x86.h"

namespace haze::recover {

int recover_every_pixel_integer_avx512(BlockRow row, const float* t, const float* next_t,
                                       int blocks, FloatAnchor anchor, const uint8_t* tone_curve) {
  return recover_every_pixel_x86<Avx512, true>(row, t, next_t, blocks, anchor, tone_curve);
}

int recover_every_pixel_float_avx512(BlockRow row, const float* t, const float* next_t, int blocks,
                                     FloatAnchor anchor, const uint8_t* tone_curve) {
  return recover_every_pixel_x86<Avx512, false>(row, t, next_t, blocks, anchor, tone_curve);
}

int recover_anchors_avx512(uint8_t* luma, const float* t, int blocks, float anchor,
                           const uint8_t* tone_curve) {
  return recover_anchors_x86<Avx512>(luma, t, blocks, anchor, tone_curve);
}

int fill_between_anchors_avx512(BlockRow row, const uint8_t* next, const float* t, int blocks,
                                FloatAnchor anchor) {
  return fill_between_anchors_x86<Avx512>(row, next, t, blocks, anchor);
}

int recover_packed_rows_avx512(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes,
                               const float* t, const float* next_t, int blocks, FloatAnchor anchor,
                               const uint8_t* tone_curve) {
  return recover_packed_rows_x86<Avx512>(src, dst, row_bytes, t, next_t, blocks, anchor,
                                         tone_curve);
}

}  // namespace haze::recover
