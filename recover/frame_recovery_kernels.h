// Row kernels of the frame recovery.
#pragma once

#include <stdint.h>

#include "core/cpu_level.h"
#include "recover/block_row.h"
#include "recover/light_anchor.h"
#include "recover/recovery_kernels.h"

namespace haze::recover {

#if HAZE_X86
// A row of 2 x 2 blocks by arithmetic, for every code; each returns the first block that it did not
// recover.
int recover_nv21_blocks_avx2(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                             const uint8_t* tone_curve);
int recover_nv21_blocks_avx512(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve);
int recover_planar_blocks_avx2(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve);
int recover_planar_blocks_avx512(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                                 const uint8_t* tone_curve);

// The same for NV21 from float transmissions, by division.
int recover_by_division_avx2(BlockRow row, const float* t, int blocks, LightAnchor anchor,
                             const uint8_t* tone_curve);
int recover_by_division_avx512(BlockRow row, const float* t, int blocks, LightAnchor anchor,
                               const uint8_t* tone_curve);
#endif

}  // namespace haze::recover
