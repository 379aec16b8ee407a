#include "tests/reference/zoom.h"

#include "tests/reference/color_convert.h"

namespace haze::reference {
namespace {

float mean(float a, float b) {
  const float sum = a + b;
  return sum * 0.5f;
}

// Column x of a row that is doubled in width.
float doubled_row(const float* row, int width, int x) {
  const int c = x / 2;
  return x % 2 == 0 || c == width - 1 ? row[c] : mean(row[c], row[c + 1]);
}

}  // namespace

ImageRows zoom_out_stripe(int height, int stripe) {
  const int even = height / 8 / 2 * 2;
  return {stripe * even, stripe == 3 ? height - 7 * even : even};
}

void zoom_out_rows(const uint8_t* frame, uint8_t* bgr, int width, int height, bool planar,
                   ImageRows luma_rows) {
  const int half_width = width / 2;
  const int blocks = half_width * (height / 2);
  const uint8_t* chroma = frame + width * height;
  for (int y = luma_rows.first; y < luma_rows.first + luma_rows.count; y += 2)
    for (int j = 0; j < half_width; ++j) {
      const int block = y / 2 * half_width + j;
      const int v = planar ? chroma[blocks + block] : chroma[2 * block];
      const int u = planar ? chroma[block] : chroma[2 * block + 1];
      const Bgr pixel = bgr_of_ycrcb(frame[y * width + 2 * j], v, u);
      bgr[3 * block] = pixel.b;
      bgr[3 * block + 1] = pixel.g;
      bgr[3 * block + 2] = pixel.r;
    }
}

void zoom_out(const uint8_t* frame, uint8_t* bgr, int width, int height, bool planar) {
  for (int stripe = 0; stripe < 8; ++stripe)
    zoom_out_rows(frame, bgr, width, height, planar, zoom_out_stripe(height, stripe));
}

void zoom_in(const float* src, float* dst, int width, int height) {
  for (int y = 0; y < 2 * height; ++y)
    for (int x = 0; x < 2 * width; ++x) {
      const int r = y / 2;
      const float upper = doubled_row(src + r * width, width, x);
      const bool own_row = y % 2 == 0 || r == height - 1;
      dst[y * 2 * width + x] =
          own_row ? upper : mean(upper, doubled_row(src + (r + 1) * width, width, x));
    }
}

}  // namespace haze::reference
