#include "media/zscale.h"

#include "media/av_error.h"
#include "media/nv21.h"

namespace dehaze {
namespace {

const char* siting_name(AVChromaLocation siting) {
  switch (siting) {
    case AVCHROMA_LOC_CENTER:
      return "center";
    case AVCHROMA_LOC_TOPLEFT:
      return "topleft";
    case AVCHROMA_LOC_TOP:
      return "top";
    case AVCHROMA_LOC_BOTTOMLEFT:
      return "bottomleft";
    case AVCHROMA_LOC_BOTTOM:
      return "bottom";
    default:
      return "left";
  }
}

const char* range_name(AVColorRange range) {
  return range == AVCOL_RANGE_JPEG ? "full" : "limited";
}

AVPixelFormat without_range(AVPixelFormat format) {
  switch (format) {
    case AV_PIX_FMT_YUVJ411P:
      return AV_PIX_FMT_YUV411P;
    case AV_PIX_FMT_YUVJ420P:
      return AV_PIX_FMT_YUV420P;
    case AV_PIX_FMT_YUVJ422P:
      return AV_PIX_FMT_YUV422P;
    case AV_PIX_FMT_YUVJ440P:
      return AV_PIX_FMT_YUV440P;
    case AV_PIX_FMT_YUVJ444P:
      return AV_PIX_FMT_YUV444P;
    default:
      return format;
  }
}

// The same format without its alpha channel. zimg would weight the colours by it.
std::string opaque_format(const AVPixFmtDescriptor& format, int bits) {
  if (format.nb_components < 3) return bits > 8 ? "gray16" : "gray";
  if (format.flags & AV_PIX_FMT_FLAG_RGB) return bits > 8 ? "gbrp16" : "gbrp";
  std::string name = format.name;  // yuva420p and the like
  const size_t position = name.find("yuva");
  if (position != std::string::npos) name.replace(position, 4, "yuv");
  return name;
}

// Of the pixels that share a chroma sample; padding takes care of pairs.
bool is_multiple(int length, int log2_chroma) {
  return log2_chroma < 2 || length % (1 << log2_chroma) == 0;
}

}  // namespace

SampleMeaning library_meaning(AVChromaLocation siting) {
  return {AVCOL_RANGE_JPEG, AVCOL_SPC_SMPTE170M, siting};
}

// zscale takes the matrix by its number in ITU-T H.273, which is what AVColorSpace holds.
std::string zscale(const SampleMeaning& from, const SampleMeaning& to, const std::string& more) {
  return "zscale=matrixin=" + std::to_string(from.matrix) + ":rangein=" + range_name(from.range) +
         ":chromalin=" + siting_name(from.siting) + ":matrix=" + std::to_string(to.matrix) +
         ":range=" + range_name(to.range) + ":chromal=" + siting_name(to.siting) + more;
}

std::string in_format(AVPixelFormat pixel_format) {
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  const bool is_rgb = (format.flags & AV_PIX_FMT_FLAG_RGB) != 0;
  return std::string(is_rgb ? ",format=gbrp" : "") + ",format=" + format.name;
}

FramePtr without_range(const AVFrame& frame) {
  FramePtr plain = make_frame();
  check(av_frame_ref(plain.get(), &frame), "cannot allocate a frame");
  plain->format = without_range(static_cast<AVPixelFormat>(frame.format));
  plain->color_range = AVCOL_RANGE_UNSPECIFIED;
  return plain;
}

std::string plain_format_filter(const AVFrame& frame) {
  const AVPixelFormat pixel_format = static_cast<AVPixelFormat>(frame.format);
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  const bool is_rgb = (format.flags & AV_PIX_FMT_FLAG_RGB) != 0;
  const bool is_coarse = is_rgb && bits_per_sample(pixel_format) < 8;
  if (is_coarse || (format.flags & AV_PIX_FMT_FLAG_PAL)) return "format=rgb24";
  if (format.flags & AV_PIX_FMT_FLAG_ALPHA) {
    return "format=" + opaque_format(format, bits_per_sample(pixel_format));
  }
  const bool is_grey = format.nb_components < 3;
  if (is_grey && (format.flags & (AV_PIX_FMT_FLAG_FLOAT | AV_PIX_FMT_FLAG_BITSTREAM))) {
    return "format=gray";
  }
  const bool is_whole = is_multiple(frame.width, format.log2_chroma_w) &&
                        is_multiple(frame.height, format.log2_chroma_h);
  if (has_fixed_pixel_step(pixel_format) && is_whole) return "";
  return "format=yuv422p|yuv420p|yuv444p";
}

}  // namespace dehaze
