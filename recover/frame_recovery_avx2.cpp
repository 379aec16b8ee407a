#include "core/simd_avx2.h"
#include "recover/frame_recovery_x86.h"

namespace haze::recover {

int recover_nv21_blocks_avx2(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                             const uint8_t* tone_curve) {
  return recover_blocks_x86<Avx2, false>(row, codes, blocks, anchor, tone_curve);
}

int recover_planar_blocks_avx2(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve) {
  return recover_blocks_x86<Avx2, true>(row, codes, blocks, anchor, tone_curve);
}

int recover_by_division_avx2(BlockRow row, const float* t, int blocks, LightAnchor anchor,
                             const uint8_t* tone_curve) {
  return recover_by_division_x86<Avx2>(row, t, blocks, anchor, tone_curve);
}

}  // namespace haze::recover
