// From a frame before and after haze removal to what a page shows of it.
#pragma once

#include <string>

#include "engine.h"
#include "media/color_convert.h"
#include "media/orientation.h"
#include "report/data.h"
#include "report/reference.h"

namespace dehaze {

class ViewMaker {
 public:
  // first: the frame that decided on `size`, `siting` and `orientation`.
  ViewMaker(const Reader& reader, const AVFrame& first, const FrameSize& size,
            AVChromaLocation siting);

  // before, after: of the padded size. reference: null if there is none.
  View make(const Nv21Frame& before, const Nv21Frame& after, const Engine& engine,
            const Reference* reference);

 private:
  FramePtr upright_rgb(const Nv21Frame& nv21);
  Jpeg jpeg(const AVFrame& rgb, size_t bytes) const;

  FrameSize size_;
  bool is_picture_;
  Orientation orientation_;
  AVRational pixel_aspect_;  // upright
  FromNv21 to_rgb_;
  FramePtr profile_;  // its side data may hold an ICC profile
};

}  // namespace dehaze
