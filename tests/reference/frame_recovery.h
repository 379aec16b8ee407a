// Per-byte definition of the recovery J = A + (I - A) / t of YUV 4:2:0 frames.
#pragma once

#include <cstdint>

namespace haze::reference {

struct LightYuv {
  int y;
  int u;
  int v;
};

// Luma and chroma of a light given as the bytes B, G, R.
LightYuv light_to_yuv(const uint8_t* light_bgr);

// 1 / t of a transmission code: 200 / (code + 40), divided in double precision, then rounded to
// single.
float recovery_factor(int code);

uint8_t recover_luma(uint8_t value, int light_y, float factor);

// The same for V with the light's V and for U with the light's U; chroma has no tone curve.
uint8_t recover_chroma(uint8_t value, int light_chroma, float factor);

// Even sizes only; the map holds (width / 2) x (height / 2) codes.
void recover_nv21(uint8_t* frame, const uint8_t* codes, const uint8_t* light_bgr, int width,
                  int height);
void recover_planar(uint8_t* frame, const uint8_t* codes, const uint8_t* light_bgr, int width,
                    int height);

}  // namespace haze::reference
