// Recovery of planar frames, whole or in stripes, from float transmissions through reciprocals.
#include "core/image_size.h"
#include "core/stripes.h"
#include "haze_preview.h"
#include "recover/block_recovery.h"
#include "recover/reciprocal_recovery.h"

unsigned char* gHRSrcPreview[haze::kSlots];
float* gHRScalePreview[haze::kSlots];
unsigned char gAYPreview[haze::kSlots];
unsigned char gACbPreview[haze::kSlots];
unsigned char gACrPreview[haze::kSlots];
int gHRWPreview;
int gHRHWPreview;

namespace {

using haze::has_blocks;
using haze::recover::FloatRecovery;
using haze::recover::IntegerRecovery;
using haze::recover::light_anchor;
using haze::recover::planar_frame;
using haze::recover::recover_anchors;
using haze::recover::recover_every_pixel;

constexpr int kStripes = 4;

}  // namespace

void HazeRemovingPreview(unsigned char* frame, float* t, unsigned char* A, int w, int h,
                         int /*ignored*/) {
  if (has_blocks(w, h))
    recover_anchors(planar_frame(frame, t, w, h), IntegerRecovery{light_anchor(A)});
}

void HazeRemoving1Preview(unsigned char* frame, float* t, unsigned char* A, int w, int h,
                          int /*ignored*/) {
  if (has_blocks(w, h))
    recover_every_pixel(planar_frame(frame, t, w, h), IntegerRecovery{light_anchor(A)});
}

void HazeRemoving2Preview(unsigned char* frame, float* t, unsigned char* A, int w, int h,
                          int /*ignored*/) {
  if (has_blocks(w, h)) recover_every_pixel(planar_frame(frame, t, w, h), FloatRecovery(A));
}

void HazeRemovingThreadPreview(unsigned char* luma, unsigned char* chroma, float* t,
                               unsigned char AY, unsigned char ACb, unsigned char ACr, int w,
                               int h) {
  if (!has_blocks(w, h)) return;
  // The second chroma plane is looked for relative to the stripe, not to the frame.
  const ptrdiff_t plane = static_cast<ptrdiff_t>(w) * h / 4;
  recover_anchors({luma, chroma, chroma + plane, t, w, h}, IntegerRecovery{{AY, ACb, ACr}});
}

void* HRThreadPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  // Of a frame with an odd height the first stripes would have whole blocks.
  if (!haze::is_stripe(code, kStripes) || !has_blocks(gHRWPreview, gHRHWPreview)) return nullptr;
  const ptrdiff_t width = gHRWPreview;
  const ptrdiff_t height = gHRHWPreview;
  const haze::StripeRange rows = haze::even_stripe(gHRHWPreview, kStripes, code.stripe);
  const ptrdiff_t blocks_before = rows.begin / 2 * (width / 2);
  HazeRemovingThreadPreview(gHRSrcPreview[code.slot] + width * rows.begin,
                            gHRSrcPreview[code.slot] + width * height + blocks_before,
                            gHRScalePreview[code.slot] + blocks_before, gAYPreview[code.slot],
                            gACbPreview[code.slot], gACrPreview[code.slot], gHRWPreview,
                            rows.end - rows.begin);
  return nullptr;
}
