#include "core/simd_avx512.h"
#include "recover/frame_recovery_x86.h"

namespace haze::recover {

int recover_nv21_blocks_avx512(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve) {
  return recover_blocks_x86<Avx512, false>(row, codes, blocks, anchor, tone_curve);
}

int recover_planar_blocks_avx512(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                                 const uint8_t* tone_curve) {
  return recover_blocks_x86<Avx512, true>(row, codes, blocks, anchor, tone_curve);
}

int recover_by_division_avx512(BlockRow row, const float* t, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve) {
  return recover_by_division_x86<Avx512>(row, t, blocks, anchor, tone_curve);
}

}  // namespace haze::recover
