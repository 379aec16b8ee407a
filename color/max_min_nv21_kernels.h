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
struct MinMaxNeon {
  uint8x8_t min;
  uint8x8_t max;
};

// Eight pixels from chroma less 128.
inline MinMaxNeon min_max_neon(uint8x8_t y, int8x8_t cr, int8x8_t cb, int16x4_t weights) {
  const ChannelOffsetsNeon offset = channel_offsets_neon(cr, cb, weights);
  const int16x8_t least = vminq_s16(offset.blue, vminq_s16(offset.green, offset.red));
  const int16x8_t most = vmaxq_s16(offset.blue, vmaxq_s16(offset.green, offset.red));
  return {add_clamped_neon(y, least), add_clamped_neon(y, most)};
}

// Same bytes, sixteen pixels a step, which halves what loads, stores and the loop cost, and at last
// eight; returns the first pixel that it did not write.
inline int max_min_row_neon(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out,
                            uint8_t* max_out, int end) {
  const int16x4_t weights = channel_weights_neon();
  int x = 0;
  for (; x + 16 <= end; x += 16) {
    const uint8x16_t y = vld2q_u8(luma + 2 * x).val[0];
    const uint8x16x2_t crcb = vld2q_u8(chroma + 2 * x);
    const int8x16_t cr = centred_neon(crcb.val[0]);
    const int8x16_t cb = centred_neon(crcb.val[1]);
    const MinMaxNeon low = min_max_neon(vget_low_u8(y), vget_low_s8(cr), vget_low_s8(cb), weights);
    const MinMaxNeon high =
        min_max_neon(vget_high_u8(y), vget_high_s8(cr), vget_high_s8(cb), weights);
    vst1q_u8(min_out + x, vcombine_u8(low.min, high.min));
    vst1q_u8(max_out + x, vcombine_u8(low.max, high.max));
  }
  for (; x + 8 <= end; x += 8) {
    const uint8x8x2_t crcb = vld2_u8(chroma + 2 * x);
    const int8x16_t centred = centred_neon(vcombine_u8(crcb.val[0], crcb.val[1]));
    const MinMaxNeon both = min_max_neon(vld2_u8(luma + 2 * x).val[0], vget_low_s8(centred),
                                         vget_high_s8(centred), weights);
    vst1_u8(min_out + x, both.min);
    vst1_u8(max_out + x, both.max);
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
