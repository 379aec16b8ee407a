// Filter descriptions for conversions by zscale (the zimg library), and frames as it wants them.
#pragma once

#include <string>

#include "media/color_tags.h"
#include "media/ffmpeg_handles.h"

namespace dehaze {

// Full-range BT.601.
SampleMeaning library_meaning(AVChromaLocation siting);

// more: further options, each after a colon.
std::string zscale(const SampleMeaning& from, const SampleMeaning& to, const std::string& more);

// Last steps after zscale, each with a comma in front. Packed RGB comes from its planar relative, so
// that the scaler only reorders bytes.
std::string in_format(AVPixelFormat format);

// The same samples, nothing said about their range. The scaler that a graph puts in where zscale
// does not know a format would squeeze full range into limited range; zscale is told the range.
FramePtr without_range(const AVFrame& frame);

// Filter for frames that cannot be padded or scaled as they are (palettes, single bits, packed
// 4:2:2, alpha channels, 4:1:1 and 4:1:0 of a size that is no multiple of 4), and for floating-point
// grey, palettes and RGB of few bits, which the scaler in front of zscale would misread or get wrong
// by several values. Empty for all others.
std::string plain_format_filter(const AVFrame& frame);

}  // namespace dehaze
