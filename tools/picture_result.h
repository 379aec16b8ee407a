// What went through a FramePath as frames of an output: a picture with all of its colours, where the
// output has room for them and the engine is the photo engine.
#pragma once

#include "frame_path.h"
#include "media/color_convert.h"
#include "media/ffmpeg_handles.h"

namespace dehaze {

// True if results of such a source have to be RGB or 4:4:4 to hold all of its colours.
bool keeps_fine_color(const FramePath& path, const AVFrame& source);

// source: the frame that the path ran last; the path keeps its input.
FramePtr before_in(const FramePath& path, const AVFrame& source, const OutputSamples& samples);
FramePtr after_in(const FramePath& path, const AVFrame& source, const OutputSamples& samples);

}  // namespace dehaze
