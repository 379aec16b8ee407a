// Half-resolution BGR images of YUV 4:2:0 frames.
#include <stddef.h>

#include "color/half_bgr_kernels.h"
#include "core/shared_int.h"
#include "haze_preview.h"

namespace {

// Converts `rows` row pairs of an NV21 frame into rows of `blocks` pixels, of which `whole` have
// two columns; `luma_step` bytes lie between row pairs.
void convert_nv21(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int blocks, int whole,
                  int rows, ptrdiff_t luma_step) {
  for (int y = 0; y < rows; ++y) {
    haze::color::half_bgr_row_nv21(luma + y * luma_step,
                                   vu + static_cast<ptrdiff_t>(y) * 2 * blocks,
                                   bgr + static_cast<ptrdiff_t>(y) * 3 * blocks, blocks, whole);
  }
}

// Pixels of a half-resolution side that ends in a block of one row or column when it is odd.
int half_rounded_up(int side) { return side < 1 ? 0 : (side - 1) / 2 + 1; }

}  // namespace

void xYCrCb2BGRPreview(unsigned char* luma, unsigned char* uPlane, unsigned char* bgr, int width,
                       int height) {
  if (width < 1) return;
  const int blocks = half_rounded_up(width);
  const ptrdiff_t frame_pixels = static_cast<ptrdiff_t>(haze::load_shared(gZoomOutHPreview)) *
                                 haze::load_shared(gZoomOutWPreview);
  const unsigned char* const vPlane = uPlane + frame_pixels / 4;
  for (int y = 0; y < half_rounded_up(height); ++y) {
    const ptrdiff_t chroma = static_cast<ptrdiff_t>(y) * blocks;
    haze::color::half_bgr_row_portable<1>(luma + static_cast<ptrdiff_t>(2 * y) * width,
                                          vPlane + chroma, uPlane + chroma, bgr + 3 * chroma, 0,
                                          blocks);
  }
}

void xYCrCb2BGRPreview_NV21(unsigned char* luma, unsigned char* vu, unsigned char* bgr, int width,
                            int height) {
  if (width < 1) return;
  convert_nv21(luma, vu, bgr, half_rounded_up(width), width / 2, half_rounded_up(height),
               2 * static_cast<ptrdiff_t>(width));
}

void xYCrCb2BGRPreviewNeon_NV21(unsigned char* luma, unsigned char* vu, unsigned char* bgr,
                                int width, int height) {
  if (width < 1) return;
  // Rounds odd sizes down, and steps from the pixels that it used: with an odd width both planes
  // drift by a byte per row.
  const int blocks = width / 2;
  convert_nv21(luma, vu, bgr, blocks, blocks, height / 2,
               2 * static_cast<ptrdiff_t>(blocks) + width);
}
