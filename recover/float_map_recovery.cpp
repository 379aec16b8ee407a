// Recovery of NV21 frames from a map of float transmissions, by division.
#include <stddef.h>
#include <stdint.h>

#include "haze_preview.h"
#include "recover/light_anchor.h"

namespace {

// clamp(trunc(anchor + (sample - anchor) / t)); what is not a number gives 0.
uint8_t recover_by_division(int anchor, uint8_t sample, float t) {
  const float value = static_cast<float>(anchor) + static_cast<float>(sample - anchor) / t;
  const float below_256 = value > 255.0f ? 255.0f : value;
  return static_cast<uint8_t>(static_cast<int>(below_256 > 0.0f ? below_256 : 0.0f));
}

// Two samples that share a transmission, for every transmission of a row.
void recover_pairs(uint8_t* samples, const float* t, int pairs, int first_anchor,
                   int second_anchor) {
  for (int x = 0; x < pairs; ++x) {
    samples[2 * x] = recover_by_division(first_anchor, samples[2 * x], t[x]);
    samples[2 * x + 1] = recover_by_division(second_anchor, samples[2 * x + 1], t[x]);
  }
}

void recover_luma(uint8_t* row, const float* t, int pairs, int anchor) {
  recover_pairs(row, t, pairs, anchor, anchor);
  for (int x = 0; x < 2 * pairs; ++x) row[x] = LutTablePreview[row[x]];
}

}  // namespace

void HazeRemoving3Preview_NV21_f(unsigned char* frame, float* transmission, unsigned char* light,
                                 int width, int height, int /*recoverArg*/) {
  if (width < 2 || height < 2) return;
  const haze::recover::LightAnchor anchor = haze::recover::light_anchor(light);
  const int blocks = width / 2;
  uint8_t* const chroma = frame + static_cast<ptrdiff_t>(width) * height;
  for (int y = 0; y < height / 2; ++y) {
    const float* const t = transmission + static_cast<ptrdiff_t>(y) * blocks;
    uint8_t* const top = frame + static_cast<ptrdiff_t>(2 * y) * width;
    recover_luma(top, t, blocks, anchor.y);
    recover_luma(top + width, t, blocks, anchor.y);
    recover_pairs(chroma + static_cast<ptrdiff_t>(y) * width, t, blocks, anchor.v, anchor.u);
  }
}
