// Full-resolution converters between BGR and YCrCb.
#include <stddef.h>
#include <stdint.h>

#include "color/bgr_ycrcb_kernels.h"
#include "core/image_size.h"
#include "core/numeric.h"
#include "haze_preview.h"

namespace {

using haze::clamp_to_byte;
using haze::pixel_count;
using haze::color::cb_of;
using haze::color::cr_of;
using haze::color::luma_of;

}  // namespace

void BGR2YCrCbPreview(unsigned char* bgr, unsigned char* ycrcb, int width, int height) {
  haze::color::bgr_to_ycrcb(bgr, ycrcb, pixel_count(width, height));
}

void YCrCb2BGRPreview(unsigned char* ycrcb, unsigned char* bgr, int width, int height) {
  haze::color::ycrcb_to_bgr(ycrcb, bgr, pixel_count(width, height));
}

// The two-byte layout: even columns hold Y, Cb and odd ones Y, Cr. An odd width or height ends in
// blocks of fewer pixels.
void xBGR2YCrCbPreview(unsigned char* bgr, unsigned char* yc, int width, int height) {
  const size_t count = pixel_count(width, height);
  for (size_t i = 0; i < count; ++i)
    yc[2 * i] = static_cast<uint8_t>(luma_of(bgr[3 * i], bgr[3 * i + 1], bgr[3 * i + 2]));
  if (count == 0) return;
  for (int y = 0; y < height; ++y) {
    // Both rows of a block hold the chroma of its top-left pixel.
    const size_t row = pixel_count(width, y);
    const size_t top_row = pixel_count(width, y & ~1);
    for (int x = 0; x < width; x += 2) {
      const size_t i = row + static_cast<size_t>(x);
      const size_t source = top_row + static_cast<size_t>(x);
      const int luma = yc[2 * source];
      yc[2 * i + 1] = clamp_to_byte(cb_of(bgr[3 * source], luma));
      if (x + 1 < width) yc[2 * i + 3] = clamp_to_byte(cr_of(bgr[3 * source + 2], luma));
    }
  }
}
