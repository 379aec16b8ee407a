// From a frame before and after haze removal to what a page shows of it.
#pragma once

#include <string>

#include "frame_path.h"
#include "media/orientation.h"
#include "report/data.h"
#include "report/reference.h"

namespace dehaze {

class ViewMaker {
 public:
  // first: the frame that the path was made for.
  ViewMaker(const Reader& reader, const AVFrame& first);

  // source: the frame that the path ran last; the path keeps its input. reference: null if there is
  // none.
  View make(const FramePath& path, const AVFrame& source, const Reference* reference);

 private:
  FramePtr upright(FramePtr rgb) const;
  Jpeg jpeg(const AVFrame& rgb, size_t bytes) const;

  bool is_picture_;
  Orientation orientation_;
  AVRational pixel_aspect_;  // upright
  FramePtr profile_;         // its side data may hold an ICC profile
};

}  // namespace dehaze
