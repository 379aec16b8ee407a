// Row kernels of the frame recovery on NEON: arithmetic in place of tables, which would not fit the
// first-level cache of small cores.
#pragma once

#include <stdint.h>
#include <string.h>

#include "core/target.h"
#include "recover/block_row.h"
#include "recover/frame_recovery.h"
#include "recover/light_anchor.h"
#include "recover/recovery_kernels.h"
#include "recover/tone_curve_neon.h"

#if HAZE_NEON
namespace haze::recover {

// recovery_factor of every code, since NEON of 32-bit ARM does not divide. Twice each, for the two
// samples of a row that belong to a block.
struct RecoveryFactors {
  float pairs[256][2];

  constexpr RecoveryFactors() : pairs() {
    for (int code = 0; code < 256; ++code) pairs[code][0] = pairs[code][1] = recovery_factor(code);
  }
};
inline constexpr RecoveryFactors kRecoveryFactors;

// Factors of eight samples, which belong to four blocks.
struct FactorsNeon {
  float32x4_t low;
  float32x4_t high;
};

inline FactorsNeon load_factors_neon(const uint8_t* codes) {
  const auto& pairs = kRecoveryFactors.pairs;
  return {vcombine_f32(vld1_f32(pairs[codes[0]]), vld1_f32(pairs[codes[1]])),
          vcombine_f32(vld1_f32(pairs[codes[2]]), vld1_f32(pairs[codes[3]]))};
}

// What samples are recovered around, in bytes and in floats: the first two lanes repeat.
struct AnchorNeon {
  uint8x8_t bytes;
  float32x4_t floats;
};

inline AnchorNeon anchor_neon(uint8_t even, uint8_t odd) {
  const uint8x8x2_t bytes = vzip_u8(vdup_n_u8(even), vdup_n_u8(odd));
  const float32x2x2_t floats = vzip_f32(vdup_n_f32(even), vdup_n_f32(odd));
  return {bytes.val[0], vcombine_f32(floats.val[0], floats.val[0])};
}

// Four recovered samples, each in the highest byte of its word. The conversion to a number with 24
// bits of fraction clamps: it saturates at 0 and just below 256, and what is above the fraction is
// the truncated value.
inline uint16x8_t recovered_words_neon(int16x4_t offsets, float32x4_t factors,
                                       float32x4_t anchors) {
  const float32x4_t scaled = vmulq_f32(vcvtq_f32_s32(vmovl_s16(offsets)), factors);
  return vreinterpretq_u16_u32(vcvtq_n_u32_f32(vaddq_f32(anchors, scaled), 24));
}

// recover_sample of eight samples, each in the high byte of its half-word.
inline uint8x16_t recover_eight_neon(uint8x8_t samples, FactorsNeon factors, AnchorNeon anchor) {
  // The difference wraps as unsigned and reads back as signed.
  const int16x8_t offsets = vreinterpretq_s16_u16(vsubl_u8(samples, anchor.bytes));
  const uint16x8_t low = recovered_words_neon(vget_low_s16(offsets), factors.low, anchor.floats);
  const uint16x8_t high = recovered_words_neon(vget_high_s16(offsets), factors.high, anchor.floats);
  return vreinterpretq_u8_u16(vuzpq_u16(low, high).val[1]);
}

inline uint8x8_t high_bytes_neon(uint8x16_t half_words) {
  return vshrn_n_u16(vreinterpretq_u16_u8(half_words), 8);
}

// V and U of four blocks, alternating.
template <ChromaLayout kLayout>
inline uint8x8_t load_chroma_neon(const uint8_t* v, const uint8_t* u) {
  if constexpr (kLayout == ChromaLayout::kInterleavedVu) return vld1_u8(v);
  uint32_t four_v;
  uint32_t four_u;
  memcpy(&four_v, v, sizeof four_v);
  memcpy(&four_u, u, sizeof four_u);
  return vzip_u8(vreinterpret_u8_u32(vdup_n_u32(four_v)), vreinterpret_u8_u32(vdup_n_u32(four_u)))
      .val[0];
}

template <ChromaLayout kLayout>
inline void store_chroma_neon(uint8x8_t vu, uint8_t* v, uint8_t* u) {
  if constexpr (kLayout == ChromaLayout::kInterleavedVu) {
    vst1_u8(v, vu);
  } else {
    const uint8x8x2_t planes = vuzp_u8(vu, vu);
    const uint32_t four_v = vget_lane_u32(vreinterpret_u32_u8(planes.val[0]), 0);
    const uint32_t four_u = vget_lane_u32(vreinterpret_u32_u8(planes.val[1]), 0);
    memcpy(v, &four_v, sizeof four_v);
    memcpy(u, &four_u, sizeof four_u);
  }
}

// A row of 2 x 2 blocks, for every code, four blocks a step; returns the first block that it did
// not recover.
template <ChromaLayout kLayout>
inline int recover_blocks_neon(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve) {
  constexpr int kChromaStep = kLayout == ChromaLayout::kInterleavedVu ? 2 : 1;
  const AnchorNeon luma = anchor_neon(anchor.y, anchor.y);
  const AnchorNeon chroma = anchor_neon(anchor.v, anchor.u);
  const ToneCurveNeon tone = load_tone_curve_neon(tone_curve);
  const int whole = blocks / 4 * 4;
  for (const uint8_t* const stop = codes + whole; codes != stop; codes += 4) {
    const FactorsNeon factors = load_factors_neon(codes);
    const uint8x16_t top = recover_eight_neon(vld1_u8(row.luma_top), factors, luma);
    const uint8x16_t bottom = recover_eight_neon(vld1_u8(row.luma_bottom), factors, luma);
    const uint8x16_t both = brighten_neon(vuzpq_u8(top, bottom).val[1], tone);
    vst1_u8(row.luma_top, vget_low_u8(both));
    vst1_u8(row.luma_bottom, vget_high_u8(both));
    const uint8x16_t vu =
        recover_eight_neon(load_chroma_neon<kLayout>(row.v, row.u), factors, chroma);
    store_chroma_neon<kLayout>(high_bytes_neon(vu), row.v, row.u);
    row.luma_top += 8;
    row.luma_bottom += 8;
    row.v += 4 * kChromaStep;
    row.u += 4 * kChromaStep;
  }
  return whole;
}

}  // namespace haze::recover
#endif
