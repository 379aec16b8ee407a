// Decoded frames to the library's NV21 and back to what an output format holds.
//
// The conversion is done by zscale (the zimg library) because each of its steps is computed at
// higher precision and rounded once, and because it can leave 4:2:0 chroma on its grid: README.md
// has the measured round trips. Where the values mean the same on both sides they are only copied.
#pragma once

#include <memory>

#include "media/color_tags.h"
#include "media/ffmpeg_handles.h"
#include "media/filter_pipe.h"
#include "media/frame_size.h"
#include "media/nv21.h"

namespace dehaze {

// Frames of any size and format to NV21 of one size.
class ToNv21 {
 public:
  ToNv21(const FrameSize& size, bool is_picture, AVChromaLocation siting);

  // True if the frame differs in size or in the meaning of its samples from the one before.
  bool convert(const AVFrame& frame, Nv21Frame& nv21);

 private:
  void rebuild(const AVFrame& frame);

  FrameSize size_;
  bool is_picture_;
  AVChromaLocation siting_;     // of the NV21 frame
  FramePtr like_;               // the frame that the pipes were built for, without its pixels
  SampleMeaning meaning_ = {};  // of its samples
  std::unique_ptr<FilterPipe> plain_pipe_;  // null: nothing to do before padding
  std::unique_ptr<FilterPipe> pipe_;        // null: copy
};

// Pixel format and meaning of an output's samples.
struct OutputSamples {
  AVPixelFormat format;  // 8 bits; RGB, 4:4:4 or 4:2:0
  SampleMeaning meaning;
};

// Marks a frame, whose samples it leaves as they are.
void set_samples(AVFrame& frame, const OutputSamples& samples);

// NV21 to frames of one output format, cropped to the visible size.
class FromNv21 {
 public:
  FromNv21(int visible_width, int visible_height, AVChromaLocation siting,
           const OutputSamples& output);

  FramePtr convert(const Nv21Frame& nv21);

 private:
  int visible_width_;
  int visible_height_;
  AVChromaLocation siting_;
  OutputSamples output_;
  std::unique_ptr<FilterPipe> pipe_;
};

}  // namespace dehaze
