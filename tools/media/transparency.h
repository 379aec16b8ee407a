// The alpha channel of a picture, which goes around the haze removal.
#pragma once

#include "media/ffmpeg_handles.h"

namespace dehaze {

// The frame's alpha channel as an 8-bit grey frame of the given size; null if it has none or is
// opaque throughout.
FramePtr take_alpha(const AVFrame& frame, int width, int height);

// The picture (rgb24 or yuv420p) with that channel (as rgba or yuva420p).
FramePtr with_alpha(const AVFrame& picture, const AVFrame& alpha);

}  // namespace dehaze
