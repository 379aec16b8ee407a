// A few frames spread evenly over a video whose length may turn out to be another than expected.
#pragma once

#include <cstdint>
#include <vector>

#include "report/data.h"

namespace dehaze {

class Gallery {
 public:
  // expected_frames: 0 if unknown.
  explicit Gallery(int64_t expected_frames);

  // To be asked for every frame in turn.
  bool wants(int64_t frame) const { return frame % step_ == 0; }
  void add(View view);

  // Four to six, or all of a shorter video, or fewer of one shorter than expected.
  std::vector<View>&& take() { return std::move(views_); }

 private:
  int64_t step_ = 1;
  std::vector<View> views_;
};

}  // namespace dehaze
