// Per-pixel definition of the BT.601 conversions in 14-bit fixed point.
#pragma once

#include <cstdint>

namespace haze::reference {

struct YCrCb {
  int y;
  int cr;
  int cb;
};

struct Bgr {
  uint8_t b;
  uint8_t g;
  uint8_t r;
};

// floor(value / 2^14) without shifting a negative number.
inline int floor_div_16384(int value) {
  return value >= 0 ? value / 16384 : -((16383 - value) / 16384);
}

inline uint8_t clamp_to_byte(int value) {
  return static_cast<uint8_t>(value < 0 ? 0 : value > 255 ? 255 : value);
}

inline int luma_of_bgr(int b, int g, int r) {
  return floor_div_16384(1868 * b + 9617 * g + 4899 * r + 8192);
}
inline int cr_of(int r, int y) { return floor_div_16384(11682 * (r - y) + 128 * 16384 + 8192); }
inline int cb_of(int b, int y) { return floor_div_16384(9241 * (b - y) + 128 * 16384 + 8192); }

// Before anything is stored: Cr may be 256.
inline YCrCb ycrcb_of_bgr(int b, int g, int r) {
  const int y = luma_of_bgr(b, g, r);
  return {y, cr_of(r, y), cb_of(b, y)};
}

inline Bgr bgr_of_ycrcb(int y, int cr, int cb) {
  const int v = cr - 128;
  const int u = cb - 128;
  return {clamp_to_byte(y + floor_div_16384(29049 * u + 8192)),
          clamp_to_byte(y + floor_div_16384(-5636 * u - 11698 * v + 8192)),
          clamp_to_byte(y + floor_div_16384(22987 * v + 8192))};
}

// Three bytes per pixel on both sides. Chroma is stored modulo 256.
void bgr_to_ycrcb(const uint8_t* bgr, uint8_t* ycrcb, int width, int height);
void ycrcb_to_bgr(const uint8_t* ycrcb, uint8_t* bgr, int width, int height);

// Two bytes per pixel, Y before Cb (even columns) or Cr (odd ones); each 2 x 2 block has the
// clamped chroma of its top-left pixel. At odd sizes the last blocks have a column or row less.
void bgr_to_two_bytes(const uint8_t* bgr, uint8_t* yc, int width, int height);

// One pixel per 2 x 2 block, from the block's top-left luma; blocks at odd borders count.
void half_bgr_nv21(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int width, int height);
void half_bgr_planar(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* bgr,
                     int width, int height);

// Whole blocks only. Read positions run on from row to row, so that odd widths fall behind.
void half_bgr_nv21_rounded_down(const uint8_t* luma, const uint8_t* vu, uint8_t* bgr, int width,
                                int height);

void split_components(const uint8_t* src, uint8_t* planes, int width, int height);

}  // namespace haze::reference
