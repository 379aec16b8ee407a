// Kernels of the full-resolution converters between BGR and YCrCb.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "color/bt601.h"
#include "core/cpu_level.h"
#include "core/numeric.h"

namespace haze::color {

// Pixels [begin, end). Chroma is not clamped: a Cr or Cb of 256, as pure red gives it, is stored as
// 0.
inline void bgr_to_ycrcb_portable(const uint8_t* bgr, uint8_t* ycrcb, size_t begin, size_t end) {
  for (size_t i = begin; i < end; ++i) {
    const int blue = bgr[3 * i];
    const int red = bgr[3 * i + 2];
    const int luma = luma_of(blue, bgr[3 * i + 1], red);
    ycrcb[3 * i] = static_cast<uint8_t>(luma);
    ycrcb[3 * i + 1] = static_cast<uint8_t>(cr_of(red, luma));
    ycrcb[3 * i + 2] = static_cast<uint8_t>(cb_of(blue, luma));
  }
}

inline void ycrcb_to_bgr_portable(const uint8_t* ycrcb, uint8_t* bgr, size_t begin, size_t end) {
  for (size_t i = begin; i < end; ++i) {
    const int luma = ycrcb[3 * i];
    const ChannelOffsets offset =
        channel_offsets(ycrcb[3 * i + 1] - kChromaZero, ycrcb[3 * i + 2] - kChromaZero);
    bgr[3 * i] = clamp_to_byte(luma + offset.blue);
    bgr[3 * i + 1] = clamp_to_byte(luma + offset.green);
    bgr[3 * i + 2] = clamp_to_byte(luma + offset.red);
  }
}

#if HAZE_X86
// Same bytes; each returns the first pixel that it did not write.
size_t bgr_to_ycrcb_avx2(const uint8_t* bgr, uint8_t* ycrcb, size_t end);
size_t bgr_to_ycrcb_avx512(const uint8_t* bgr, uint8_t* ycrcb, size_t end);
size_t ycrcb_to_bgr_avx2(const uint8_t* ycrcb, uint8_t* bgr, size_t end);
size_t ycrcb_to_bgr_avx512(const uint8_t* ycrcb, uint8_t* bgr, size_t end);
#endif

inline void bgr_to_ycrcb(const uint8_t* bgr, uint8_t* ycrcb, size_t count) {
  size_t done = 0;
#if HAZE_X86
  if (const auto kernel = x86_kernel(bgr_to_ycrcb_avx2, bgr_to_ycrcb_avx512))
    done = kernel(bgr, ycrcb, count);
#endif
  bgr_to_ycrcb_portable(bgr, ycrcb, done, count);
}

inline void ycrcb_to_bgr(const uint8_t* ycrcb, uint8_t* bgr, size_t count) {
  size_t done = 0;
#if HAZE_X86
  if (const auto kernel = x86_kernel(ycrcb_to_bgr_avx2, ycrcb_to_bgr_avx512))
    done = kernel(ycrcb, bgr, count);
#endif
  ycrcb_to_bgr_portable(ycrcb, bgr, done, count);
}

}  // namespace haze::color
