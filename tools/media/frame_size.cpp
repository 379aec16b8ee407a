#include "media/frame_size.h"

#include <algorithm>
#include <cmath>
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
                ", so enlarge it first");
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
                ", so crop it first");
  }
  return size;
}

}  // namespace dehaze
