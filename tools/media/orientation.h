// How stored pixels have to be turned for display: the display matrix of video containers and the
// orientation tag of EXIF.
#pragma once

#include <cstdint>
#include <string>

#include "media/ffmpeg_handles.h"

namespace dehaze {

struct Orientation {
  bool transposed = false;  // rows become columns, before the flips
  bool flipped_x = false;
  bool flipped_y = false;

  bool is_upright() const { return !transposed && !flipped_x && !flipped_y; }
  // Filter graph that brings the pixels upright, "null" if they are.
  std::string filter() const;
};

// Display matrix as in libavutil/display.h: nine fixed-point numbers. Angles that are no multiple
// of 90 degrees are taken to the nearest one.
Orientation orientation_of_matrix(const int32_t* matrix);

// Of a decoded picture: its display matrix, else the EXIF tag among its metadata.
Orientation orientation_of_picture(const AVFrame& frame);

// Of a frame: the display matrix of its stream, else as above.
Orientation orientation_of(const AVStream& stream, const AVFrame& frame);

// Display matrix of a stream, null if it has none.
const int32_t* display_matrix(const AVStream& stream);

}  // namespace dehaze
