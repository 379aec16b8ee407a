// The scene without haze, frame by frame.
#pragma once

#include <string>

#include "media/orientation.h"
#include "media/reader.h"

namespace dehaze {

class Reference {
 public:
  // Throws Error unless it is of the input's kind.
  Reference(const std::string& path, bool is_picture);

  // Takes the next frame. Throws Error if there is none.
  void advance();

  // The frame as packed RGB, upright, at the size of the result. Throws Error unless its size is
  // that of the result or of the input, which the result may be a reduction of.
  FramePtr rgb_like(const AVFrame& result, int input_width, int input_height) const;

 private:
  FramePtr rgb() const;

  Reader reader_;
  FramePtr frame_ = make_frame();
};

}  // namespace dehaze
