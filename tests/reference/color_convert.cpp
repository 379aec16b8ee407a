#include "tests/reference/color_convert.h"

namespace haze::reference {
namespace {

void store(Bgr pixel, uint8_t* bgr) {
  bgr[0] = pixel.b;
  bgr[1] = pixel.g;
  bgr[2] = pixel.r;
}

uint8_t low_byte(int value) { return static_cast<uint8_t>(value % 256); }

}  // namespace

void bgr_to_ycrcb(const uint8_t* bgr, uint8_t* ycrcb, int width, int height) {
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int at = 3 * (y * width + x);
      const YCrCb pixel = ycrcb_of_bgr(bgr[at], bgr[at + 1], bgr[at + 2]);
      ycrcb[at] = clamp_to_byte(pixel.y);
      ycrcb[at + 1] = low_byte(pixel.cr);
      ycrcb[at + 2] = low_byte(pixel.cb);
    }
}

void ycrcb_to_bgr(const uint8_t* ycrcb, uint8_t* bgr, int width, int height) {
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int at = 3 * (y * width + x);
      store(bgr_of_ycrcb(ycrcb[at], ycrcb[at + 1], ycrcb[at + 2]), bgr + at);
    }
}

void bgr_to_two_bytes(const uint8_t* bgr, uint8_t* yc, int width, int height) {
  const auto stored_luma = [&](int x, int y) {
    const uint8_t* pixel = bgr + 3 * (y * width + x);
    return clamp_to_byte(luma_of_bgr(pixel[0], pixel[1], pixel[2]));
  };
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int corner_x = x - x % 2;
      const int corner_y = y - y % 2;
      const uint8_t* corner = bgr + 3 * (corner_y * width + corner_x);
      const int corner_luma = stored_luma(corner_x, corner_y);
      const int chroma = x % 2 == 0 ? cb_of(corner[0], corner_luma) : cr_of(corner[2], corner_luma);
      const int at = 2 * (y * width + x);
      yc[at] = stored_luma(x, y);
      yc[at + 1] = clamp_to_byte(chroma);
    }
}

void half_bgr_nv21(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int width, int height) {
  if (width < 1 || height < 1) return;
  const int half_width = (width + 1) / 2;
  for (int row = 0; 2 * row < height; ++row)
    for (int j = 0; j < half_width; ++j) {
      const int block = row * half_width + j;
      store(bgr_of_ycrcb(luma[2 * row * width + 2 * j], vu[2 * block], vu[2 * block + 1]),
            bgr + 3 * block);
    }
}

void half_bgr_planar(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* bgr,
                     int width, int height) {
  if (width < 1 || height < 1) return;
  const int half_width = (width + 1) / 2;
  for (int row = 0; 2 * row < height; ++row)
    for (int j = 0; j < half_width; ++j) {
      const int block = row * half_width + j;
      store(bgr_of_ycrcb(luma[2 * row * width + 2 * j], v[block], u[block]), bgr + 3 * block);
    }
}

void half_bgr_nv21_rounded_down(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int width,
                                int height) {
  if (width < 1 || height < 1) return;
  const int half_width = width / 2;
  for (int row = 0; row < height / 2; ++row)
    for (int j = 0; j < half_width; ++j) {
      const int block = row * half_width + j;
      const int luma_at = row * (2 * half_width + width) + 2 * j;
      store(bgr_of_ycrcb(luma[luma_at], vu[2 * block], vu[2 * block + 1]), bgr + 3 * block);
    }
}

void split_components(const uint8_t* src, uint8_t* planes, int width, int height) {
  const int count = width * height;
  if (width < 1 || height < 1) return;
  for (int component = 0; component < 4; ++component)
    for (int i = 0; i < count; ++i) planes[component * count + i] = src[4 * i + component];
}

}  // namespace haze::reference
