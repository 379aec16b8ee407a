// Vector paths of the recovery through reciprocals. Each returns the first block that it did not
// finish; where there is no vector path that is the first of all.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "haze_preview.h"
#include "recover/block_row.h"
#include "recover/light_anchor.h"

namespace haze::recover {

#if HAZE_X86
int recover_every_pixel_integer_avx2(BlockRow row, const float* t, const float* next_t, int blocks,
                                     FloatAnchor anchor, const uint8_t* tone_curve);
int recover_every_pixel_integer_avx512(BlockRow row, const float* t, const float* next_t,
                                       int blocks, FloatAnchor anchor, const uint8_t* tone_curve);
int recover_every_pixel_float_avx2(BlockRow row, const float* t, const float* next_t, int blocks,
                                   FloatAnchor anchor, const uint8_t* tone_curve);
int recover_every_pixel_float_avx512(BlockRow row, const float* t, const float* next_t, int blocks,
                                     FloatAnchor anchor, const uint8_t* tone_curve);
int recover_anchors_avx2(uint8_t* luma, const float* t, int blocks, float anchor,
                         const uint8_t* tone_curve);
int recover_anchors_avx512(uint8_t* luma, const float* t, int blocks, float anchor,
                           const uint8_t* tone_curve);
int fill_between_anchors_avx2(BlockRow row, const uint8_t* next, const float* t, int blocks,
                              FloatAnchor anchor);
int fill_between_anchors_avx512(BlockRow row, const uint8_t* next, const float* t, int blocks,
                                FloatAnchor anchor);
int recover_packed_rows_avx2(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes, const float* t,
                             const float* next_t, int blocks, FloatAnchor anchor,
                             const uint8_t* tone_curve);
int recover_packed_rows_avx512(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes,
                               const float* t, const float* next_t, int blocks, FloatAnchor anchor,
                               const uint8_t* tone_curve);
#endif

// `kInteger`: J = A + ((sample - A) * k >> 8); else J = A + (sample - A) * (k / 256) in single
// precision.
template <bool kInteger>
inline int recover_every_pixel_vectors(BlockRow row, const float* t, const float* next_t,
                                       int blocks, FloatAnchor anchor) {
#if HAZE_X86
  if (const auto kernel =
          kInteger
              ? x86_kernel(recover_every_pixel_integer_avx2, recover_every_pixel_integer_avx512)
              : x86_kernel(recover_every_pixel_float_avx2, recover_every_pixel_float_avx512))
    return kernel(row, t, next_t, blocks, anchor, LutTablePreview);
#endif
  (void)row, (void)t, (void)next_t, (void)blocks, (void)anchor;
  return 0;
}

inline int recover_anchors_vectors(uint8_t* luma, const float* t, int blocks, FloatAnchor anchor) {
#if HAZE_X86
  if (const auto kernel = x86_kernel(recover_anchors_avx2, recover_anchors_avx512))
    return kernel(luma, t, blocks, anchor.y, LutTablePreview);
#endif
  (void)luma, (void)t, (void)blocks, (void)anchor;
  return 0;
}

inline int fill_between_anchors_vectors(BlockRow row, const uint8_t* next, const float* t,
                                        int blocks, FloatAnchor anchor) {
#if HAZE_X86
  if (const auto kernel = x86_kernel(fill_between_anchors_avx2, fill_between_anchors_avx512))
    return kernel(row, next, t, blocks, anchor);
#endif
  (void)row, (void)next, (void)t, (void)blocks, (void)anchor;
  return 0;
}

inline int recover_packed_rows_vectors(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes,
                                       const float* t, const float* next_t, int blocks,
                                       FloatAnchor anchor) {
#if HAZE_X86
  if (const auto kernel = x86_kernel(recover_packed_rows_avx2, recover_packed_rows_avx512))
    return kernel(src, dst, row_bytes, t, next_t, blocks, anchor, LutTablePreview);
#endif
  (void)src, (void)dst, (void)row_bytes, (void)t, (void)next_t, (void)blocks, (void)anchor;
  return 0;
}

}  // namespace haze::recover
