// Colours that 4:2:0 has no room for. They go around the haze removal: what a picture holds beyond
// its way to NV21 and back is put onto the result. By the haze model, J = A + (I - A) / t, whatever
// is finer than a block of t comes out 1 / t times as strong.
#pragma once

#include <vector>

#include "media/color_convert.h"
#include "media/ffmpeg_handles.h"

namespace dehaze {

// True if pictures in that format have more chroma samples than 4:2:0.
bool has_fine_color(AVPixelFormat format);

// A picture as RGB or 4:4:4, straight from its own samples.
FramePtr in_samples(const AVFrame& picture, const OutputSamples& samples);

// result += gain * (fine - coarse). The three frames have one size and one format, RGB or 4:4:4 of
// 8 bits; gain has a value for each 2 x 2 pixels.
void add_color_detail(const AVFrame& fine, const AVFrame& coarse, const std::vector<float>& gain,
                      AVFrame& result);

}  // namespace dehaze
