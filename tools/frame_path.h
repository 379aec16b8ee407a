// The way of every frame through the library: to NV21, haze removal, NV21.
#ifndef TOOLS_FRAME_PATH_H
#define TOOLS_FRAME_PATH_H

#include "console.h"
#include "haze_session.h"
#include "media/color_convert.h"
#include "media/ffmpeg_handles.h"
#include "media/frame_size.h"
#include "media/nv21.h"

namespace dehaze {

class FramePath {
 public:
  // The first frame decides on the size that all frames are brought to. Notes what is lost on the
  // way (size, bits, fields).
  FramePath(const AVFrame& first, bool is_picture, int level, Console& console);

  const FrameSize& size() const { return size_; }
  AVChromaLocation siting() const { return siting_; }
  const FrameTimes& times() const { return session_.times(); }

  // The result is valid until the next call.
  const Nv21Frame& run(const AVFrame& frame);

 private:
  FrameSize size_;
  AVChromaLocation siting_;
  Console& console_;
  ToNv21 to_nv21_;
  HazeSession session_;
  Nv21Frame nv21_;
  bool change_noted_ = false;
};

}  // namespace dehaze

#endif  // TOOLS_FRAME_PATH_H
