// What a single picture shows of haze.
#pragma once

#include <array>

#include "media/orientation.h"
#include "photo/haze_map.h"

namespace dehaze {

struct HazeEvidence {
  double nearby;          // haze over the nearest things, 0 ... 1.5; above 0.08 it is plain
  double amount;          // of the haze that is to be taken out, by what looks like a veil: 0 ... 1
  double largest_amount;  // that does not leave the picture too dark: 0 ... 1
};

// Part of a share of haze, both 0 ... 1, that is not the things' own.
double haze_of_share(double share);

// exact_light: blue, green, red, as light before rounding. model: of this picture, or a mean over
// frames.
HazeEvidence find_haze(BgrImage& small, const GuidedModel& model, const Light& light,
                       const std::array<double, 3>& exact_light, const Orientation& orientation);

}  // namespace dehaze
