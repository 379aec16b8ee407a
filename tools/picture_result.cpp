#include "picture_result.h"

#include "media/color_detail.h"

namespace dehaze {
namespace {

FramePtr convert(const Nv21Frame& nv21, const FramePath& path, const OutputSamples& samples) {
  const FrameSize& size = path.size();
  return FromNv21(size.visible_width, size.visible_height, path.siting(), samples).convert(nv21);
}

}  // namespace

bool keeps_fine_color(const FramePath& path, const AVFrame& source) {
  return path.has_detail() && has_fine_color(static_cast<AVPixelFormat>(source.format));
}

FramePtr before_in(const FramePath& path, const AVFrame& source, const OutputSamples& samples) {
  return keeps_fine_color(path, source) ? in_samples(source, samples)
                                        : convert(path.input(), path, samples);
}

FramePtr after_in(const FramePath& path, const AVFrame& source, const OutputSamples& samples) {
  FramePtr result = convert(path.result(), path, samples);
  if (keeps_fine_color(path, source) && !is_420(samples.format)) {
    add_color_detail(*in_samples(source, samples), *convert(path.input(), path, samples),
                     path.detail_gain(), *result);
  }
  return result;
}

}  // namespace dehaze
