#include "media/color_convert.h"

#include <string>

#include "errors.h"
#include "media/av_error.h"

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

// zscale takes the matrix by its number in ITU-T H.273, which is what AVColorSpace holds.
std::string zscale(const SampleMeaning& from, const SampleMeaning& to, const std::string& more) {
  return "zscale=matrixin=" + std::to_string(from.matrix) + ":rangein=" + range_name(from.range) +
         ":chromalin=" + siting_name(from.siting) + ":matrix=" + std::to_string(to.matrix) +
         ":range=" + range_name(to.range) + ":chromal=" + siting_name(to.siting) + more;
}

SampleMeaning library_meaning(AVChromaLocation siting) {
  return {AVCOL_RANGE_JPEG, AVCOL_SPC_SMPTE170M, siting};
}

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

// The same samples, nothing said about their range. The scaler that a graph puts in where zscale
// does not know a format would squeeze full range into limited range; zscale is told the range.
FramePtr without_range(const AVFrame& frame) {
  FramePtr plain = make_frame();
  check(av_frame_ref(plain.get(), &frame), "cannot allocate a frame");
  plain->format = without_range(static_cast<AVPixelFormat>(frame.format));
  plain->color_range = AVCOL_RANGE_UNSPECIFIED;
  return plain;
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

// Filter for formats that cannot be padded or scaled as they are (palettes, single bits, packed
// 4:2:2, alpha channels), and for floating-point grey, which the scaler in front of zscale would
// misread. Empty for all others.
std::string plain_format_filter(AVPixelFormat pixel_format) {
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  if (format.flags & AV_PIX_FMT_FLAG_PAL) return "format=gbrp";
  if (format.flags & AV_PIX_FMT_FLAG_ALPHA) {
    return "format=" + opaque_format(format, bits_per_sample(pixel_format));
  }
  const bool is_grey = format.nb_components < 3;
  if (is_grey && (format.flags & (AV_PIX_FMT_FLAG_FLOAT | AV_PIX_FMT_FLAG_BITSTREAM))) {
    return "format=gray";
  }
  if (has_fixed_pixel_step(pixel_format)) return "";
  const bool is_rgb = (format.flags & AV_PIX_FMT_FLAG_RGB) != 0;
  return is_rgb ? "format=gbrp" : "format=yuv422p|yuv420p|yuv444p";
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
    const std::string filter = plain_format_filter(static_cast<AVPixelFormat>(plain->format));
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
      const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(output_.format);
      // The planar relative of packed RGB, so that the last step only reorders bytes.
      const bool is_rgb = (format.flags & AV_PIX_FMT_FLAG_RGB) != 0;
      const std::string last = std::string(is_rgb ? ",format=gbrp" : "") + ",format=" + format.name;
      const bool keeps_chroma_grid = is_420(output_.format) && output_.meaning.siting == siting_;
      pipe_ = std::make_unique<FilterPipe>(
          *frame,
          zscale(library_meaning(siting_), output_.meaning, resampling(keeps_chroma_grid)) + last);
    }
    frame = pipe_->run(*frame);
  }
  frame->format = output_.format;  // yuvj420p differs from yuv420p in name alone
  frame->width = visible_width_;
  frame->height = visible_height_;
  frame->color_range = output_.meaning.range;
  frame->colorspace = output_.meaning.matrix;
  frame->chroma_location = output_.meaning.siting;
  return frame;
}

}  // namespace dehaze
