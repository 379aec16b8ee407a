// Raw 4:2:0 frames among the formats of FFmpeg's libraries.
#pragma once

#include "media/ffmpeg_handles.h"
#include "raw_format.h"

namespace dehaze {

// YV12 is I420 with its chroma planes swapped, see swap_chroma.
AVPixelFormat pixel_format_of(RawLayout layout);

void swap_chroma(AVFrame& planar);

// The options that the demultiplexer of raw video needs.
void set_raw_options(const RawFormat& format, Dictionary& options);

// What the values of the frames mean.
void set_raw_meaning(const RawFormat& format, AVCodecParameters& stream);

}  // namespace dehaze
