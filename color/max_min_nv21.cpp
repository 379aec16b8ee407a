// Half-resolution minimum and maximum colour channels of an NV21 frame.
#include <stddef.h>

#include "color/max_min_nv21_kernels.h"
#include "haze_preview.h"

void xYCrCb2BGRMaxMinPreviewNeon_NV21(unsigned char* luma, unsigned char* chroma,
                                      unsigned char* minOut, unsigned char* maxOut, int width,
                                      int height) {
  const int out_width = width / 2;
  const int out_height = height / 2;
  if (out_width <= 0 || out_height <= 0) return;
  // Steps count from the pixels of a row that were used: with an odd width both planes drift by a
  // byte per row.
  const ptrdiff_t chroma_step = 2 * static_cast<ptrdiff_t>(out_width);
  const ptrdiff_t luma_step = chroma_step + width;
  for (int y = 0; y < out_height; ++y) {
    haze::color::max_min_row(luma + y * luma_step, chroma + y * chroma_step,
                             minOut + static_cast<ptrdiff_t>(y) * out_width,
                             maxOut + static_cast<ptrdiff_t>(y) * out_width, out_width);
  }
}
