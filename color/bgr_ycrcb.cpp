// Full-resolution converters between BGR and YCrCb.
#include <stddef.h>
#include <stdint.h>

#include "color/bt601.h"
#include "core/image_size.h"
#include "core/numeric.h"
#include "haze_preview.h"

namespace {

using haze::clamp_to_byte;
using haze::pixel_count;
using haze::color::cb_of;
using haze::color::channel_offsets;
using haze::color::ChannelOffsets;
using haze::color::cr_of;
using haze::color::kChromaZero;
using haze::color::luma_of;

}  // namespace

void BGR2YCrCbPreview(unsigned char* bgr, unsigned char* ycrcb, int width, int height) {
  const size_t count = pixel_count(width, height);
  for (size_t i = 0; i < count; ++i) {
    const int blue = bgr[3 * i];
    const int red = bgr[3 * i + 2];
    const int luma = luma_of(blue, bgr[3 * i + 1], red);
    ycrcb[3 * i] = static_cast<uint8_t>(luma);
    // Not clamped: a Cr or Cb of 256, as pure red gives it, is stored as 0.
    ycrcb[3 * i + 1] = static_cast<uint8_t>(cr_of(red, luma));
    ycrcb[3 * i + 2] = static_cast<uint8_t>(cb_of(blue, luma));
  }
}

void YCrCb2BGRPreview(unsigned char* ycrcb, unsigned char* bgr, int width, int height) {
  const size_t count = pixel_count(width, height);
  for (size_t i = 0; i < count; ++i) {
    const int luma = ycrcb[3 * i];
    const ChannelOffsets offset =
        channel_offsets(ycrcb[3 * i + 1] - kChromaZero, ycrcb[3 * i + 2] - kChromaZero);
    bgr[3 * i] = clamp_to_byte(luma + offset.blue);
    bgr[3 * i + 1] = clamp_to_byte(luma + offset.green);
    bgr[3 * i + 2] = clamp_to_byte(luma + offset.red);
  }
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
