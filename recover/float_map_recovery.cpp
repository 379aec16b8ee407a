// Recovery of NV21 frames from a map of float transmissions, by division.
#include <stddef.h>
#include <stdint.h>

#include <initializer_list>

#include "core/image_size.h"
#include "haze_preview.h"
#include "recover/frame_recovery_kernels.h"

namespace {

// clamp(trunc(anchor + (sample - anchor) / t)); what is not a number gives 0.
uint8_t recover_by_division(int anchor, uint8_t sample, float t) {
  const float value = static_cast<float>(anchor) + static_cast<float>(sample - anchor) / t;
  const float below_256 = value > 255.0f ? 255.0f : value;
  return static_cast<uint8_t>(static_cast<int>(below_256 > 0.0f ? below_256 : 0.0f));
}

using haze::recover::BlockRow;
using haze::recover::LightAnchor;

// Recovers the first blocks of a row in vectors where there are any; returns how many.
int leading_blocks(BlockRow row, const float* t, int blocks, LightAnchor anchor) {
#if HAZE_X86
  if (const auto kernel = haze::x86_kernel(haze::recover::recover_by_division_avx2,
                                           haze::recover::recover_by_division_avx512))
    return kernel(row, t, blocks, anchor, LutTablePreview);
#endif
  (void)row, (void)t, (void)blocks, (void)anchor;
  return 0;
}

// Blocks [begin, end) of a row of NV21 blocks.
void recover_blocks(BlockRow row, const float* t, int begin, int end, LightAnchor anchor) {
  for (int x = begin; x < end; ++x) {
    for (uint8_t* luma : {row.luma_top + 2 * x, row.luma_top + 2 * x + 1, row.luma_bottom + 2 * x,
                          row.luma_bottom + 2 * x + 1})
      *luma = LutTablePreview[recover_by_division(anchor.y, *luma, t[x])];
    row.v[2 * x] = recover_by_division(anchor.v, row.v[2 * x], t[x]);
    row.u[2 * x] = recover_by_division(anchor.u, row.u[2 * x], t[x]);
  }
}

}  // namespace

void HazeRemoving3Preview_NV21_f(unsigned char* frame, float* transmission, unsigned char* light,
                                 int width, int height, int /*recoverArg*/) {
  if (!haze::has_blocks(width, height)) return;
  const LightAnchor anchor = haze::recover::light_anchor(light);
  const int blocks = width / 2;
  uint8_t* const chroma = frame + static_cast<ptrdiff_t>(width) * height;
  for (int y = 0; y < height / 2; ++y) {
    const float* const t = transmission + static_cast<ptrdiff_t>(y) * blocks;
    uint8_t* const top = frame + static_cast<ptrdiff_t>(2 * y) * width;
    uint8_t* const vu = chroma + static_cast<ptrdiff_t>(y) * width;
    const BlockRow row = {top, top + width, vu, vu + 1};
    recover_blocks(row, t, leading_blocks(row, t, blocks, anchor), blocks, anchor);
  }
}
