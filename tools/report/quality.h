// How close a picture comes to one of the same scene without haze.
#pragma once

#include "media/ffmpeg_handles.h"
#include "picture_metrics.h"

namespace dehaze {

struct Quality {
  double psnr = 0;       // dB
  double ssim = 0;       // 1: equal
  double ciede2000 = 0;  // mean difference of colours
  double hue_shift = 0;  // degrees
};

// From a packed RGB frame.
RgbPicture picture_of(const AVFrame& rgb);

constexpr int kSmallestComparedSide = 11;  // the window of the SSIM

// Both of one size, at least kSmallestComparedSide in either direction.
Quality quality_of(const RgbPicture& picture, const RgbPicture& clear);

}  // namespace dehaze
