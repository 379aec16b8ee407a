// Pictures small enough to be part of a page.
#pragma once

#include <cstddef>
#include <string>

#include "media/ffmpeg_handles.h"

namespace dehaze {

struct JpegLimits {
  int longest_side;
  size_t bytes;
};

struct Jpeg {
  int width = 0;
  int height = 0;
  std::string bytes;
};

// A packed RGB frame as a JPEG file within the limits: scaled down to the longest side, then at the
// best quality that fits, then smaller. pixel_aspect: width to height of a pixel, 0/1 if unknown;
// the file has square ones. An ICC profile of moderate size among the frame's side data is kept.
Jpeg jpeg_within(const AVFrame& rgb, AVRational pixel_aspect, const JpegLimits& limits);

}  // namespace dehaze
