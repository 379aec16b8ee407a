#include "media/raw_frames.h"

extern "C" {
#include <libavutil/pixdesc.h>
}

#include <string>
#include <utility>

namespace dehaze {

AVPixelFormat pixel_format_of(RawLayout layout) {
  switch (layout) {
    case RawLayout::kNv12:
      return AV_PIX_FMT_NV12;
    case RawLayout::kNv21:
      return AV_PIX_FMT_NV21;
    default:
      return AV_PIX_FMT_YUV420P;
  }
}

void swap_chroma(AVFrame& planar) {
  std::swap(planar.data[1], planar.data[2]);
  std::swap(planar.linesize[1], planar.linesize[2]);
}

void set_raw_options(const RawFormat& format, Dictionary& options) {
  const std::string size = std::to_string(format.width) + "x" + std::to_string(format.height);
  const std::string rate = std::to_string(format.rate_num) + "/" + std::to_string(format.rate_den);
  options.set("video_size", size.c_str());
  options.set("framerate", rate.c_str());
  options.set("pixel_format", av_get_pix_fmt_name(pixel_format_of(format.layout)));
}

void set_raw_meaning(const RawFormat& format, AVCodecParameters& stream) {
  stream.color_range = format.is_full_range ? AVCOL_RANGE_JPEG : AVCOL_RANGE_MPEG;
  // Limited range is left to the guess by size.
  if (format.is_full_range) stream.color_space = AVCOL_SPC_SMPTE170M;
}

}  // namespace dehaze
