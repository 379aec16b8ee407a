#include "report/reference.h"

#include "errors.h"
#include "media/color_convert.h"
#include "media/filter_pipe.h"
#include "media/writer_picture.h"

namespace dehaze {
namespace {

std::string size_text(int width, int height) {
  return std::to_string(width) + " x " + std::to_string(height);
}

const char* kind_name(bool is_picture) { return is_picture ? "a picture" : "a video"; }

}  // namespace

Reference::Reference(const std::string& path, bool is_picture) : reader_(path) {
  if (reader_.is_picture() == is_picture) return;
  throw Error(path + ": is " + kind_name(!is_picture) + ", but the input is " +
              kind_name(is_picture));
}

void Reference::advance() {
  reader_.pending().clear();
  if (!reader_.read_frame(frame_.get())) {
    throw Error(reader_.path() + ": has fewer frames than the input");
  }
}

// A picture's own samples at full chroma resolution. Video takes the way of the input, which knows
// what its values mean where the tags are missing.
FramePtr Reference::rgb() const {
  if (reader_.is_picture()) return run_filter(*frame_, "format=rgb24");
  const int width = frame_->width;
  const int height = frame_->height;
  const FrameSize size{width, height, width, height};
  const AVChromaLocation siting = meaning_of(*frame_, false).siting;
  Nv21Frame nv21(size.padded_width(), size.padded_height());
  ToNv21(size, false, siting).convert(*frame_, nv21);
  return FromNv21(width, height, siting, picture_samples(OutputKind::kPng, siting)).convert(nv21);
}

FramePtr Reference::rgb_like(const AVFrame& result, int input_width, int input_height) const {
  FramePtr clear = rgb();
  const Orientation orientation = orientation_of(reader_.video(), *frame_);
  if (!orientation.is_upright()) clear = run_filter(*clear, orientation.filter());
  if (clear->width == result.width && clear->height == result.height) return clear;
  if (clear->width != input_width || clear->height != input_height) {
    throw Error(reader_.path() + ": the reference is " + size_text(clear->width, clear->height) +
                ", but the input is " + size_text(input_width, input_height));
  }
  return run_filter(*clear, "scale=w=" + std::to_string(result.width) +
                                ":h=" + std::to_string(result.height) + ":flags=lanczos");
}

}  // namespace dehaze
