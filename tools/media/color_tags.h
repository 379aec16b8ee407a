// What the sample values of a frame mean: tags where there are any, the usual guesses elsewhere.
#pragma once

#include "media/ffmpeg_handles.h"

extern "C" {
#include <libavutil/pixdesc.h>
}

namespace dehaze {

struct SampleMeaning {
  AVColorRange range;
  AVColorSpace matrix;
  AVChromaLocation siting;

  // BT.601 under either of its two names, with all 256 values in use: what the library works on.
  bool is_library_color() const;
};

// Decoded frame to meaning. Guesses where the tags are missing:
//   range   full for RGB and grey pictures, limited for YUV
//   matrix  BT.601 for pictures and for full range (JPEG and camera previews); otherwise by size,
//           BT.709 from 1280 columns or more than 576 rows on
//   siting  centre for pictures (JFIF), left for video (MPEG-2)
SampleMeaning meaning_of(const AVFrame& frame, bool is_picture);

// By size, for limited-range video without a tag.
AVColorSpace guessed_video_matrix(int width, int height);

// Of the widest component.
int bits_per_sample(AVPixelFormat format);

bool is_420(AVPixelFormat format);

bool is_floating_point(AVPixelFormat format);

}  // namespace dehaze
