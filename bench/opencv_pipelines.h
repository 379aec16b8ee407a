// The same method written with OpenCV, as a yardstick for whole frames.
#pragma once

#include <opencv2/core.hpp>

#include "bench/case.h"

namespace haze::bench {

// 8-bit and half resolution where possible, in ready buffers: what a developer in a hurry for time
// would write.
class FastPipeline {
 public:
  explicit FastPipeline(Size frame);
  void estimate(const Bytes& nv21);
  void recover(Bytes& nv21);

 private:
  Size size_;
  double light_ = 0;
  cv::Mat y_, cr_, cb_, ycrcb_, bgr_, channels_[3], min_, max_, mean_, bound_, t_, factor_full_,
      factor_half_, floats_, tone_;
};

// The dark-channel-prior paper of 2009 with the guided filter of 2010, full resolution in floats.
void classic_pipeline(Bytes& nv21, Size frame);

}  // namespace haze::bench
