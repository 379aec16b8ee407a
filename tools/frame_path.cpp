#include "frame_path.h"

#include <string>

#include "media/color_tags.h"

namespace dehaze {
namespace {

void note_losses(const AVFrame& frame, const FrameSize& size, Console& console) {
  if (size.is_scaled()) {
    console.note("scaled down from " + std::to_string(size.source_width) + " x " +
                 std::to_string(size.source_height) + " to " + std::to_string(size.visible_width) +
                 " x " + std::to_string(size.visible_height) + " (frames have at most " +
                 std::to_string(kMaxFrameWidth) + " x " + std::to_string(kMaxFrameHeight) + ")");
  }
  const int bits = bits_per_sample(static_cast<AVPixelFormat>(frame.format));
  if (bits > 8) console.note(std::to_string(bits) + "-bit input is converted to 8 bits");
  if (frame.interlaced_frame) {
    console.note("interlaced video is treated as progressive; deinterlace it first if it combs");
  }
}

}  // namespace

FramePath::FramePath(const AVFrame& first, bool is_picture, int level, Console& console)
    : size_(fit_frame_size(first.width, first.height)),
      siting_(meaning_of(first, is_picture).siting),
      console_(console),
      to_nv21_(size_, is_picture, siting_),
      session_(size_.padded_width(), size_.padded_height(), level),
      nv21_(size_.padded_width(), size_.padded_height()) {
  note_losses(first, size_, console);
}

const Nv21Frame& FramePath::run(const AVFrame& frame) {
  if (to_nv21_.convert(frame, nv21_) && !change_noted_) {
    change_noted_ = true;
    console_.note("the frames change size or colour format in mid-stream; all are brought to " +
                  std::to_string(size_.visible_width) + " x " +
                  std::to_string(size_.visible_height));
  }
  session_.process(nv21_);
  return nv21_;
}

}  // namespace dehaze
