// Colours as people see them: CIE L*a*b* and the colour difference CIEDE2000.
#pragma once

#include <cstdint>

namespace dehaze {

struct Lab {
  double l;
  double a;
  double b;
};

// Of an sRGB pixel (IEC 61966-2-1), for its own white, D65.
Lab lab_of_srgb(const uint8_t* rgb);

// CIEDE2000 with kL = kC = kH = 1.
double ciede2000(const Lab& first, const Lab& second);

double chroma(const Lab& color);

// Angle between the hues of two colours, 0 ... 180 degrees; 0 if one of them has none.
double hue_difference(const Lab& first, const Lab& second);

}  // namespace dehaze
