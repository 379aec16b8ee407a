// Kernels of the full-resolution converters between BGR and YCrCb.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "color/bt601.h"
#include "color/bt601_neon.h"
#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/target.h"

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

#if HAZE_NEON
// The weights in lanes, which GCC would otherwise fill again for every eight pixels.
struct YcrcbWeightsNeon {
  uint16x4_t luma;   // of blue, green and red
  int16x4_t chroma;  // Cr of red, Cb of blue
};

inline YcrcbWeightsNeon ycrcb_weights_neon() {
  const uint16_t luma[4] = {kBt601LumaFromBlue, kBt601LumaFromGreen, kBt601LumaFromRed};
  const int16_t chroma[4] = {kBt601CrFromRed, kBt601CbFromBlue};
  return {vld1_u16(luma), vld1_s16(chroma)};
}

// luma_of of eight pixels. Range: the products sum to less than 2^22.
inline uint8x8_t luma_neon(uint8x8x3_t bgr, uint16x4_t weights) {
  const uint16x8_t b = vmovl_u8(bgr.val[0]);
  const uint16x8_t g = vmovl_u8(bgr.val[1]);
  const uint16x8_t r = vmovl_u8(bgr.val[2]);
  uint32x4_t low = vmull_lane_u16(vget_low_u16(b), weights, 0);
  uint32x4_t high = vmull_lane_u16(vget_high_u16(b), weights, 0);
  low = vmlal_lane_u16(low, vget_low_u16(g), weights, 1);
  high = vmlal_lane_u16(high, vget_high_u16(g), weights, 1);
  low = vmlal_lane_u16(low, vget_low_u16(r), weights, 2);
  high = vmlal_lane_u16(high, vget_high_u16(r), weights, 2);
  return vmovn_u16(vcombine_u16(vrshrn_n_u32(low, kBt601Bits), vrshrn_n_u32(high, kBt601Bits)));
}

// cr_of or cb_of of eight pixels, as stored. The difference wraps as unsigned and reads back as
// signed. Exact: vqrdmulh(2d, k) = (2 * 2d * k + 2^15) >> 16 = (d * k + 2^13) >> 14, and adding 128
// to a byte inverts its highest bit.
template <int kLane>
inline uint8x8_t chroma_neon(uint8x8_t colour, uint8x8_t luma, int16x4_t weights) {
  const int16x8_t difference = vreinterpretq_s16_u16(vsubl_u8(colour, luma));
  const int16x8_t chroma = vqrdmulhq_lane_s16(vaddq_s16(difference, difference), weights, kLane);
  return veor_u8(vmovn_u16(vreinterpretq_u16_s16(chroma)), vdup_n_u8(kChromaZero));
}

// Same bytes, eight pixels a step; each returns the first pixel that it did not write.
inline size_t bgr_to_ycrcb_neon(const uint8_t* bgr, uint8_t* ycrcb, size_t end) {
  const YcrcbWeightsNeon weights = ycrcb_weights_neon();
  const size_t whole = end / 8 * 8;
  for (const uint8_t* const stop = bgr + 3 * whole; bgr != stop; bgr += 24, ycrcb += 24) {
    const uint8x8x3_t pixels = vld3_u8(bgr);
    uint8x8x3_t converted;
    converted.val[0] = luma_neon(pixels, weights.luma);
    converted.val[1] = chroma_neon<0>(pixels.val[2], converted.val[0], weights.chroma);
    converted.val[2] = chroma_neon<1>(pixels.val[0], converted.val[0], weights.chroma);
    vst3_u8(ycrcb, converted);
  }
  return whole;
}

inline size_t ycrcb_to_bgr_neon(const uint8_t* ycrcb, uint8_t* bgr, size_t end) {
  const int16x4_t weights = channel_weights_neon();
  const size_t whole = end / 8 * 8;
  for (const uint8_t* const stop = ycrcb + 3 * whole; ycrcb != stop; ycrcb += 24, bgr += 24) {
    const uint8x8x3_t pixels = vld3_u8(ycrcb);
    const int8x16_t chroma = centred_neon(vcombine_u8(pixels.val[1], pixels.val[2]));
    const ChannelOffsetsNeon offset =
        channel_offsets_neon(vget_low_s8(chroma), vget_high_s8(chroma), weights);
    uint8x8x3_t converted;
    converted.val[0] = add_clamped_neon(pixels.val[0], offset.blue);
    converted.val[1] = add_clamped_neon(pixels.val[0], offset.green);
    converted.val[2] = add_clamped_neon(pixels.val[0], offset.red);
    vst3_u8(bgr, converted);
  }
  return whole;
}
#endif

#if HAZE_X86
// Same bytes; each returns the first pixel that it did not write.
size_t bgr_to_ycrcb_avx2(const uint8_t* bgr, uint8_t* ycrcb, size_t end);
size_t bgr_to_ycrcb_avx512(const uint8_t* bgr, uint8_t* ycrcb, size_t end);
size_t ycrcb_to_bgr_avx2(const uint8_t* ycrcb, uint8_t* bgr, size_t end);
size_t ycrcb_to_bgr_avx512(const uint8_t* ycrcb, uint8_t* bgr, size_t end);
#endif

inline void bgr_to_ycrcb(const uint8_t* bgr, uint8_t* ycrcb, size_t count) {
  size_t done = 0;
#if HAZE_NEON
  done = bgr_to_ycrcb_neon(bgr, ycrcb, count);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(bgr_to_ycrcb_avx2, bgr_to_ycrcb_avx512))
    done = kernel(bgr, ycrcb, count);
#endif
  bgr_to_ycrcb_portable(bgr, ycrcb, done, count);
}

inline void ycrcb_to_bgr(const uint8_t* ycrcb, uint8_t* bgr, size_t count) {
  size_t done = 0;
#if HAZE_NEON
  done = ycrcb_to_bgr_neon(ycrcb, bgr, count);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(ycrcb_to_bgr_avx2, ycrcb_to_bgr_avx512))
    done = kernel(ycrcb, bgr, count);
#endif
  ycrcb_to_bgr_portable(ycrcb, bgr, done, count);
}

}  // namespace haze::color
