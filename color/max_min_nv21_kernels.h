// Row kernels of the half-resolution minimum and maximum channels of an NV21 frame.
#pragma once

#include <stdint.h>

#include "color/bt601.h"
#include "color/bt601_neon.h"
#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/target.h"

namespace haze::color {

// Output pixels [begin, end) of one row. `luma` is the even luma row, `chroma` the chroma row that
// belongs to it.
//
// Clamping is monotone, hence the minimum and maximum can be taken of the offsets and clamped after
// luma has been added once.
inline void max_min_row_portable(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                                 uint8_t* max_out, int begin, int end) {
  for (int x = begin; x < end; ++x) {
    const int y = luma[2 * x];
    const ChannelOffsets offset =
        channel_offsets(chroma[2 * x] - kChromaZero, chroma[2 * x + 1] - kChromaZero);
    min_out[x] = clamp_to_byte(y + min(offset.blue, min(offset.green, offset.red)));
    max_out[x] = clamp_to_byte(y + max(offset.blue, max(offset.green, offset.red)));
  }
}

#if HAZE_NEON
// Same bytes, eight pixels a step; returns the first pixel that it did not write.
inline int max_min_row_neon(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                            uint8_t* max_out, int end) {
  const int16x4_t weights = channel_weights_neon();
  int x = 0;
  for (; x + 8 <= end; x += 8) {
    const uint8x8_t y = vld2_u8(luma).val[0];
    const uint8x8x2_t crcb = vld2_u8(chroma);
    const ChannelOffsetsNeon offset = channel_offsets_neon(crcb.val[0], crcb.val[1], weights);
    const int16x8_t least = vminq_s16(offset.blue, vminq_s16(offset.green, offset.red));
    const int16x8_t most = vmaxq_s16(offset.blue, vmaxq_s16(offset.green, offset.red));
    vst1_u8(min_out, add_clamped_neon(y, least));
    vst1_u8(max_out, add_clamped_neon(y, most));
    luma += 16;
    chroma += 16;
    min_out += 8;
    max_out += 8;
  }
  return x;
}
#endif

#if HAZE_X86
// Same bytes, in files of their own for each level.
int max_min_row_avx2(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out, uint8_t* max_out,
                     int end);
int max_min_row_avx512(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                       uint8_t* max_out, int end);
#endif

inline void max_min_row(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                        uint8_t* max_out, int width) {
  int x = 0;
#if HAZE_NEON
  x = max_min_row_neon(luma, chroma, min_out, max_out, width);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(max_min_row_avx2, max_min_row_avx512))
    x = kernel(luma, chroma, min_out, max_out, width);
#endif
  max_min_row_portable(luma, chroma, min_out, max_out, x, width);
}

}  // namespace haze::color
