#include "media/color_convert.h"

#include <string>

#include "errors.h"
#include "media/zscale.h"

namespace dehaze {
namespace {

// A change of matrix between two 4:2:0 frames of one size needs chroma at every luma sample, but
// should not move it: taking the nearest sample both ways leaves chroma on its grid, so that the
// way to NV21 and back returns it unchanged. All other changes need a real filter.
std::string resampling(bool keeps_chroma_grid) {
  return keeps_chroma_grid ? ":filter=point" : ":filter=lanczos";
}

FramePtr without_pixels(const AVFrame& frame) {
  FramePtr like = make_frame();
  like->format = frame.format;
  like->width = frame.width;
  like->height = frame.height;
  like->color_range = frame.color_range;
  like->colorspace = frame.colorspace;
  like->chroma_location = frame.chroma_location;
  return like;
}

bool is_alike(const AVFrame& a, const AVFrame& b) {
  return a.format == b.format && a.width == b.width && a.height == b.height &&
         a.color_range == b.color_range && a.colorspace == b.colorspace &&
         a.chroma_location == b.chroma_location;
}

}  // namespace

ToNv21::ToNv21(const FrameSize& size, bool is_picture, AVChromaLocation siting)
    : size_(size), is_picture_(is_picture), siting_(siting) {}

bool ToNv21::convert(const AVFrame& frame, Nv21Frame& nv21) {
  const bool is_first = like_ == nullptr;
  const bool has_changed = is_first || !is_alike(frame, *like_);
  if (has_changed) {
    like_ = without_pixels(frame);
    meaning_ = meaning_of(frame, is_picture_);
  }
  const FramePtr plain = without_range(frame);
  if (has_changed) {
    const std::string filter = plain_format_filter(*plain);
    plain_pipe_ = filter.empty() ? nullptr : std::make_unique<FilterPipe>(*plain, filter);
  }
  const FramePtr padded = pad_to_even(plain_pipe_ ? *plain_pipe_->run(*plain) : *plain);
  if (has_changed) rebuild(*padded);
  if (pipe_) {
    pack_nv21(*pipe_->run(*padded), nv21);
  } else {
    pack_nv21(*padded, nv21);
  }
  return has_changed && !is_first;
}

void ToNv21::rebuild(const AVFrame& frame) {
  const AVPixelFormat format = static_cast<AVPixelFormat>(frame.format);
  const int width = size_.padded_width();
  const int height = size_.padded_height();
  const bool same_size = frame.width == width && frame.height == height;
  pipe_.reset();
  if (same_size && meaning_.is_library_color() && meaning_.siting == siting_ &&
      format == AV_PIX_FMT_YUV420P) {
    return;
  }
  std::string more = ":width=" + std::to_string(width) + ":height=" + std::to_string(height);
  more += resampling(same_size && is_420(format) && meaning_.siting == siting_);
  // The haze removal raises contrast up to 2.5 times; without dithering that would show the steps
  // of 8 bits in smooth skies that the input had more bits for.
  if (bits_per_sample(format) > 8) more += ":dither=error_diffusion";
  pipe_ = std::make_unique<FilterPipe>(
      frame, zscale(meaning_, library_meaning(siting_), more) + ",format=yuv420p");
}

void set_samples(AVFrame& frame, const OutputSamples& samples) {
  frame.format = samples.format;  // yuvj420p differs from yuv420p in name alone
  frame.color_range = samples.meaning.range;
  frame.colorspace = samples.meaning.matrix;
  frame.chroma_location = samples.meaning.siting;
}

FromNv21::FromNv21(int visible_width, int visible_height, AVChromaLocation siting,
                   const OutputSamples& output)
    : visible_width_(visible_width),
      visible_height_(visible_height),
      siting_(siting),
      output_(output) {}

FramePtr FromNv21::convert(const Nv21Frame& nv21) {
  FramePtr frame = unpack_nv21(nv21);
  const bool is_copy = is_420(output_.format) && output_.meaning.is_library_color() &&
                       output_.meaning.siting == siting_;
  if (!is_copy) {
    if (!pipe_) {
      const bool keeps_chroma_grid = is_420(output_.format) && output_.meaning.siting == siting_;
      pipe_ = std::make_unique<FilterPipe>(
          *frame, zscale(library_meaning(siting_), output_.meaning, resampling(keeps_chroma_grid)) +
                      in_format(output_.format));
    }
    frame = pipe_->run(*frame);
  }
  frame->width = visible_width_;
  frame->height = visible_height_;
  set_samples(*frame, output_);
  return frame;
}

}  // namespace dehaze
