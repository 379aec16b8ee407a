#include "core/simd_avx2.h"
#include "recover/reciprocal_x86.h"

namespace haze::recover {

int recover_every_pixel_integer_avx2(BlockRow row, const float* t, const float* next_t, int blocks,
                                     FloatAnchor anchor, const uint8_t* tone_curve) {
  return recover_every_pixel_x86<Avx2, true>(row, t, next_t, blocks, anchor, tone_curve);
}

int recover_every_pixel_float_avx2(BlockRow row, const float* t, const float* next_t, int blocks,
                                   FloatAnchor anchor, const uint8_t* tone_curve) {
  return recover_every_pixel_x86<Avx2, false>(row, t, next_t, blocks, anchor, tone_curve);
}

int recover_anchors_avx2(uint8_t* luma, const float* t, int blocks, float anchor,
                         const uint8_t* tone_curve) {
  return recover_anchors_x86<Avx2>(luma, t, blocks, anchor, tone_curve);
}

int fill_between_anchors_avx2(BlockRow row, const uint8_t* next, const float* t, int blocks,
                              FloatAnchor anchor) {
  return fill_between_anchors_x86<Avx2>(row, next, t, blocks, anchor);
}

int recover_packed_rows_avx2(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes, const float* t,
                             const float* next_t, int blocks, FloatAnchor anchor,
                             const uint8_t* tone_curve) {
  return recover_packed_rows_x86<Avx2>(src, dst, row_bytes, t, next_t, blocks, anchor, tone_curve);
}

}  // namespace haze::recover
