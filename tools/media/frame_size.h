// Which part of an input frame reaches the library at which size.
#pragma once

#include <cstdint>

namespace dehaze {

// Limits of the library's frame path, which is the preview engine.
constexpr int kMaxFrameWidth = 1280;
constexpr int kMaxFrameHeight = 720;
constexpr int kMinFrameSide = 128;

// Limits of the building blocks as the photo engine uses them. The smallest half-resolution map has
// 4 x 4 samples, which a guided filter needs; sizes in bytes have to fit 32-bit arithmetic.
constexpr int kMinPhotoSide = 8;
constexpr int kMaxPhotoSide = 32768;
constexpr int64_t kMaxPhotoPixels = int64_t{8192} * 16384;

struct FrameSize {
  int source_width;
  int source_height;
  int visible_width;  // after scaling down; may be odd if nothing was scaled
  int visible_height;

  int padded_width() const { return visible_width + visible_width % 2; }
  int padded_height() const { return visible_height + visible_height % 2; }
  bool is_scaled() const {
    return visible_width != source_width || visible_height != source_height;
  }
  bool is_padded() const { return visible_width % 2 != 0 || visible_height % 2 != 0; }
};

// Larger frames are scaled down to fit, keeping their shape to the nearest even size. Throws Error
// for frames that are too small, also those that are so only after scaling.
FrameSize fit_frame_size(int width, int height);

// Frames keep their size. Throws Error for those beyond the limits of the photo engine.
FrameSize whole_frame_size(int width, int height);

}  // namespace dehaze
