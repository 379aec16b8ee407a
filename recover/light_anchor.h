// The atmospheric light as the luma and chroma values around which samples are recovered.
#pragma once

#include <stdint.h>

namespace haze::recover {

struct LightAnchor {
  uint8_t y;
  uint8_t u;
  uint8_t v;

  friend bool operator==(LightAnchor a, LightAnchor b) {
    return a.y == b.y && a.u == b.u && a.v == b.v;
  }
};

// The same where fractions are kept.
struct FloatAnchor {
  float y;
  float u;
  float v;
};

// BT.601: Y = 0.587 G + 0.114 B + 0.299 R, U = 128 + 0.564 (B - Y), V = 128 + 0.713 (R - Y), in
// double precision, each truncated to a byte.
//
// The order of the sum is part of the result: for some grey lights its rounding falls just short of
// the integer, and Y is one less than the light. Range: Y is at most 255, U and V lie in 0 ... 255,
// since B - Y stays within +-226 and R - Y within +-179.
inline LightAnchor light_anchor(const uint8_t* light_bgr) {
  const double blue = light_bgr[0];
  const double green = light_bgr[1];
  const double red = light_bgr[2];
  double luma = green * 0.587;
  luma = luma + blue * 0.114;
  luma = luma + red * 0.299;
  const uint8_t y = static_cast<uint8_t>(luma);
  return {y, static_cast<uint8_t>(128.0 + (blue - y) * 0.564),
          static_cast<uint8_t>(128.0 + (red - y) * 0.713)};
}

}  // namespace haze::recover
