// The library's frame and its exchange with the planar frames of FFmpeg's libraries.
#pragma once

#include <cstdint>
#include <vector>

#include "media/ffmpeg_handles.h"

namespace dehaze {

// Full-range BT.601: width x height luma bytes, then height / 2 rows of V, U pairs.
struct Nv21Frame {
  Nv21Frame(int frame_width, int frame_height)
      : width(frame_width),
        height(frame_height),
        bytes(static_cast<size_t>(frame_width) * static_cast<size_t>(frame_height) * 3 / 2) {}

  int width;
  int height;
  std::vector<uint8_t> bytes;
};

// Both work on 8-bit planar 4:2:0 of exactly the frame's size and leave the sample values as they
// are.
void pack_nv21(const AVFrame& planar, Nv21Frame& nv21);
FramePtr unpack_nv21(const Nv21Frame& nv21);

// A frame whose size is rounded up to even numbers, the last column and row repeated. Works on
// formats whose pixels are whole bytes at a fixed distance in every plane; others are returned as
// they are, see has_fixed_pixel_step. 4:2:0 chroma of an odd size is rounded up already.
FramePtr pad_to_even(const AVFrame& frame);
bool has_fixed_pixel_step(AVPixelFormat format);

}  // namespace dehaze
