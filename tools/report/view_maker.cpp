#include "report/view_maker.h"

#include <numeric>
#include <utility>

#include "errors.h"
#include "media/filter_pipe.h"
#include "media/writer_picture.h"
#include "picture_result.h"
#include "show.h"

namespace dehaze {
namespace {

// Together with the other frames of a video, and with base64's third on top, a page stays below
// three megabytes.
constexpr int kPictureSide = 1600;
constexpr int kVideoSide = 960;
constexpr size_t kPictureBytes = 600000;
constexpr size_t kVideoBytes = 95000;
// A map is smooth.
constexpr int kMapShare = 4;

FramePtr reference_to(const AVFrame& frame) {
  FramePtr copy = make_frame();
  if (av_frame_copy_props(copy.get(), &frame) < 0) throw std::bad_alloc();
  return copy;
}

AVRational turned(AVRational aspect, const Orientation& orientation) {
  if (orientation.transposed && aspect.num > 0) std::swap(aspect.num, aspect.den);
  return aspect;
}

void add_profile(const AVFrame& from, AVFrame& to) {
  const AVFrameSideData* profile = av_frame_get_side_data(&from, AV_FRAME_DATA_ICC_PROFILE);
  if (profile == nullptr) return;
  AVBufferRef* const buffer = av_buffer_ref(profile->buf);
  if (av_frame_new_side_data_from_buf(&to, profile->type, buffer) == nullptr) {
    throw std::bad_alloc();
  }
}

double mean(const std::vector<float>& values) {
  return std::accumulate(values.begin(), values.end(), 0.0) / static_cast<double>(values.size());
}

bool is_comparable(const RgbPicture& picture) {
  return picture.width >= kSmallestComparedSide && picture.height >= kSmallestComparedSide;
}

}  // namespace

ViewMaker::ViewMaker(const Reader& reader, const AVFrame& first)
    : is_picture_(reader.is_picture()),
      orientation_(orientation_of(reader.video(), first)),
      // What viewers do: they stretch video, but no pictures.
      pixel_aspect_(is_picture_ ? AVRational{0, 1}
                                : turned(reader.sample_aspect_ratio(first), orientation_)),
      profile_(reference_to(first)) {}

FramePtr ViewMaker::upright(FramePtr rgb) const {
  return orientation_.is_upright() ? std::move(rgb) : run_filter(*rgb, orientation_.filter());
}

Jpeg ViewMaker::jpeg(const AVFrame& rgb, size_t bytes) const {
  return jpeg_within(rgb, pixel_aspect_, {is_picture_ ? kPictureSide : kVideoSide, bytes});
}

View ViewMaker::make(const FramePath& path, const AVFrame& source, const Reference* reference) {
  const OutputSamples samples = picture_samples(OutputKind::kPng, path.siting());
  const FrameSize& size = path.size();
  const size_t bytes = is_picture_ ? kPictureBytes : kVideoBytes;
  View view;
  view.findings = path.engine().findings();

  const std::vector<float> transmission = path.engine().transmission();
  view.mean_transmission = mean(transmission);
  Nv21Frame map(size.padded_width(), size.padded_height());
  draw_map(transmission, map);
  FromNv21 to_rgb(size.visible_width, size.visible_height, path.siting(), samples);
  view.map = jpeg(*upright(to_rgb.convert(map)), bytes / kMapShare);

  const FramePtr rgb_before = upright(before_in(path, source, samples));
  const FramePtr rgb_after = upright(after_in(path, source, samples));
  const RgbPicture picture_before = picture_of(*rgb_before);
  const RgbPicture picture_after = picture_of(*rgb_after);
  view.tones_before = tones_of(picture_before);
  view.tones_after = tones_of(picture_after);
  add_profile(*profile_, *rgb_before);
  add_profile(*profile_, *rgb_after);
  view.before = jpeg(*rgb_before, bytes);
  view.after = jpeg(*rgb_after, bytes);

  if (reference == nullptr) return view;
  const bool transposed = orientation_.transposed;
  const FramePtr clear =
      reference->rgb_like(*rgb_after, transposed ? size.source_height : size.source_width,
                          transposed ? size.source_width : size.source_height);
  view.clear = jpeg(*clear, bytes / 2);
  if (is_comparable(picture_after)) {
    const RgbPicture picture_clear = picture_of(*clear);
    view.quality_before = quality_of(picture_before, picture_clear);
    view.quality_after = quality_of(picture_after, picture_clear);
  }
  return view;
}

}  // namespace dehaze
