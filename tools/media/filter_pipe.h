// A filter graph with one input and one output that gives one frame for each frame.
#pragma once

#include <string>

#include "media/ffmpeg_handles.h"

namespace dehaze {

class FilterPipe {
 public:
  // Built for frames of the size and pixel format of `like`.
  FilterPipe(const AVFrame& like, const std::string& description);

  FramePtr run(const AVFrame& frame);

 private:
  FilterGraphPtr graph_;
  AVFilterContext* source_ = nullptr;  // both owned by the graph
  AVFilterContext* sink_ = nullptr;
};

// For a single frame.
FramePtr run_filter(const AVFrame& frame, const std::string& description);

}  // namespace dehaze
