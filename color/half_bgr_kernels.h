// Row kernels of the half-resolution BGR image of a YUV 4:2:0 frame.
#pragma once

#include <stdint.h>

#include "color/bt601.h"
#include "color/bt601_neon.h"
#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/target.h"

namespace haze::color {

// Output pixels [begin, end) of one row, each from the top-left luma byte of its 2 x 2 block.
// `kChromaStep` bytes lie between chroma samples of one kind: 2 for NV21, 1 for planes.
template <int kChromaStep>
inline void half_bgr_row_portable(const uint8_t* luma, const uint8_t* v, const uint8_t* u,
                                  uint8_t* bgr, int begin, int end) {
  for (int x = begin; x < end; ++x) {
    const int y = luma[2 * x];
    const ChannelOffsets offset =
        channel_offsets(v[kChromaStep * x] - kChromaZero, u[kChromaStep * x] - kChromaZero);
    bgr[3 * x] = clamp_to_byte(y + offset.blue);
    bgr[3 * x + 1] = clamp_to_byte(y + offset.green);
    bgr[3 * x + 2] = clamp_to_byte(y + offset.red);
  }
}

#if HAZE_NEON
// Same bytes from interleaved chroma (V first), eight pixels a step; returns the first pixel that
// it did not write.
inline int half_bgr_row_neon(const uint8_t* luma, const uint8_t* vu_row, uint8_t* bgr, int end) {
  const int16x4_t weights = channel_weights_neon();
  int x = 0;
  for (; x + 8 <= end; x += 8) {
    const uint8x8_t y = vld2_u8(luma + 2 * x).val[0];
    const uint8x8x2_t chroma = vld2_u8(vu_row + 2 * x);
    const int8x16_t vu = centred_neon(vcombine_u8(chroma.val[0], chroma.val[1]));
    const ChannelOffsetsNeon offset =
        channel_offsets_neon(vget_low_s8(vu), vget_high_s8(vu), weights);
    // Named, since vst3_u8 may be a macro that takes the commas of an initialiser for its own.
    const uint8x8x3_t pixels = {{add_clamped_neon(y, offset.blue),
                                 add_clamped_neon(y, offset.green),
                                 add_clamped_neon(y, offset.red)}};
    vst3_u8(bgr + 3 * x, pixels);
  }
  return x;
}
#endif

#if HAZE_X86
int half_bgr_row_avx2(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int end);
int half_bgr_row_avx512(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int end);
#endif

// `vu` is a row of NV21 chroma. Of the `blocks` blocks the first `whole` have two columns of luma,
// as the vector paths read them: the byte behind a last single column may be past the image.
inline void half_bgr_row_nv21(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int blocks,
                              int whole) {
  int x = 0;
#if HAZE_NEON
  x = half_bgr_row_neon(luma, vu, bgr, whole);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(half_bgr_row_avx2, half_bgr_row_avx512))
    x = kernel(luma, vu, bgr, whole);
#else
  (void)whole;
#endif
  half_bgr_row_portable<2>(luma, vu, vu + 1, bgr, x, blocks);
}

}  // namespace haze::color
