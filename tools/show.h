// Views of what an engine did, in place of its result.
#pragma once

#include <string>
#include <vector>

#include "engine.h"
#include "media/nv21.h"

namespace dehaze {

// The transmission as grey: black where there is nothing but haze, white where there is none.
// transmission: (width / 2) x (height / 2) values in [0, 1].
void draw_map(const std::vector<float>& transmission, Nv21Frame& frame);

// One view, split in the middle by a thin white line: the left half of `before` is put over
// `frame`.
void draw_compare(const Nv21Frame& before, Nv21Frame& frame);

// The same for what tells how many times stronger detail became in each 2 x 2 pixels: once as strong
// in the left half, gone in the line.
void draw_compare_gain(std::vector<float>& gain, int frame_width);

// "light 200 203 208 strength 64": red, green, blue.
std::string describe(const HazeFindings& findings);

}  // namespace dehaze
