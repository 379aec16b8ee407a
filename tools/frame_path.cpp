#include "frame_path.h"

#include <string>

#include "media/color_tags.h"
#include "show.h"

namespace dehaze {
namespace {

void note_losses(const AVFrame& frame, const FrameSize& size, Console& console) {
  if (size.is_scaled()) {
    console.note("scaled down from " + std::to_string(size.source_width) + " x " +
                 std::to_string(size.source_height) + " to " + std::to_string(size.visible_width) +
                 " x " + std::to_string(size.visible_height) +
                 " (the preview engine takes at most " + std::to_string(kMaxFrameWidth) + " x " +
                 std::to_string(kMaxFrameHeight) + "; --engine photo keeps the size)");
  }
  const int bits = bits_per_sample(static_cast<AVPixelFormat>(frame.format));
  if (is_floating_point(static_cast<AVPixelFormat>(frame.format))) {
    console.note("floating-point input is cut off at 1 and converted to 8 bits as it is");
  } else if (bits > 8) {
    console.note(std::to_string(bits) + "-bit input is converted to 8 bits");
  }
  if (frame.color_trc == AVCOL_TRC_SMPTE2084 || frame.color_trc == AVCOL_TRC_ARIB_STD_B67) {
    console.note(
        "HDR values stay as they are, in 8 bits; for ordinary screens convert it to SDR first");
  }
  if (frame.interlaced_frame) {
    console.note("interlaced video is treated as progressive; deinterlace it first if it combs");
  }
}

}  // namespace

double frames_per_second(const Reader& reader) {
  const AVRational rate = reader.frame_rate();
  return rate.num > 0 && rate.den > 0 ? av_q2d(rate) : 0;
}

Source source_of(const Reader& reader, const AVFrame& first) {
  Source source;
  source.is_picture = reader.is_picture();
  source.frames_per_second = reader.is_picture() ? 0 : frames_per_second(reader);
  source.orientation = orientation_of(reader.video(), first);
  return source;
}

FramePath::FramePath(const AVFrame& first, const Source& source, const EngineOptions& options,
                     Console& console)
    : FramePath(choose_engine(options, first.width, first.height, source.is_picture), first, source,
                options, console) {}

FramePath::FramePath(EngineKind kind, const AVFrame& first, const Source& source,
                     const EngineOptions& options, Console& console)
    : kind_(kind),
      size_(engine_frame_size(kind, first.width, first.height)),
      siting_(meaning_of(first, source.is_picture).siting),
      is_picture_(source.is_picture),
      show_(options.show),
      console_(console),
      to_nv21_(size_, source.is_picture, siting_),
      engine_(
          make_engine(kind, options, size_.padded_width(), size_.padded_height(), source, console)),
      nv21_(size_.padded_width(), size_.padded_height()),
      keeps_input_(show_ == Show::kCompare) {
  note_losses(first, size_, console);
}

const Nv21Frame& FramePath::run(const AVFrame& frame) {
  if (to_nv21_.convert(frame, nv21_) && !change_noted_) {
    change_noted_ = true;
    console_.note("the frames change size or colour format in mid-stream; all are brought to " +
                  std::to_string(size_.visible_width) + " x " +
                  std::to_string(size_.visible_height));
  }
  if (keeps_input_) input_ = nv21_;
  engine_->process(nv21_);
  if (show_ == Show::kMap) draw_map(engine_->transmission(), nv21_);
  if (show_ == Show::kCompare) draw_compare(input_, nv21_);
  return nv21_;
}

bool FramePath::has_detail() const {
  return is_picture_ && kind_ == EngineKind::kPhoto && show_ != Show::kMap;
}

std::vector<float> FramePath::detail_gain() const {
  std::vector<float> gain = engine_->transmission();
  for (float& value : gain) value = 1 / value;
  if (show_ == Show::kCompare) draw_compare_gain(gain, nv21_.width);
  return gain;
}

}  // namespace dehaze
