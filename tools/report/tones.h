// How the tones of a picture are spread.
#pragma once

#include <array>
#include <cstdint>

#include "picture_metrics.h"

namespace dehaze {

using Histogram = std::array<int64_t, 256>;

struct Tones {
  Histogram luma{};  // BT.601, full range
  Histogram red{};
  Histogram green{};
  Histogram blue{};
  double mean = 0;       // of luma
  double deviation = 0;  // of luma: its contrast
  double clipped = 0;    // share of the pixels with a channel at 0 or 255
};

Tones tones_of(const RgbPicture& picture);

}  // namespace dehaze
