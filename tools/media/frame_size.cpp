#include "media/frame_size.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <string>

#include "errors.h"

namespace dehaze {
namespace {

int nearest_even(double length) { return 2 * static_cast<int>(std::lround(length / 2)); }

std::string text(int width, int height) {
  return std::to_string(width) + " x " + std::to_string(height);
}

}  // namespace

FrameSize fit_frame_size(int width, int height) {
  const std::string smallest = text(kMinFrameSide, kMinFrameSide);
  if (width < kMinFrameSide || height < kMinFrameSide) {
    throw Error("the picture is " + text(width, height) + "; it must be at least " + smallest +
                ", so enlarge it first or use --engine photo");
  }
  FrameSize size = {width, height, width, height};
  if (width <= kMaxFrameWidth && height <= kMaxFrameHeight) return size;

  const double scale = std::min(static_cast<double>(kMaxFrameWidth) / width,
                                static_cast<double>(kMaxFrameHeight) / height);
  size.visible_width = std::min(nearest_even(width * scale), kMaxFrameWidth);
  size.visible_height = std::min(nearest_even(height * scale), kMaxFrameHeight);
  if (size.visible_width < kMinFrameSide || size.visible_height < kMinFrameSide) {
    throw Error("the picture is " + text(width, height) + ", too long and narrow: scaled into " +
                text(kMaxFrameWidth, kMaxFrameHeight) + " it falls below " + smallest +
                ", so crop it first or use --engine photo");
  }
  return size;
}

FrameSize whole_frame_size(int width, int height) {
  if (width < kMinPhotoSide || height < kMinPhotoSide) {
    throw Error("the picture is " + text(width, height) + "; it must be at least " +
                text(kMinPhotoSide, kMinPhotoSide) + ", so enlarge it first");
  }
  const int64_t pixels = static_cast<int64_t>(width) * height;
  if (width > kMaxPhotoSide || height > kMaxPhotoSide || pixels > kMaxPhotoPixels) {
    throw Error("the picture is " + text(width, height) + "; it may have at most " +
                std::to_string(kMaxPhotoPixels / 1000000) + " megapixels and no side above " +
                std::to_string(kMaxPhotoSide) + ", so reduce it first");
  }
  return {width, height, width, height};
}

}  // namespace dehaze
