#include "media/color_tags.h"

#include <algorithm>

namespace dehaze {
namespace {

// Those that a conversion exists for; anything else counts as missing.
bool is_usable(AVColorSpace matrix) {
  switch (matrix) {
    case AVCOL_SPC_BT709:
    case AVCOL_SPC_FCC:
    case AVCOL_SPC_BT470BG:
    case AVCOL_SPC_SMPTE170M:
    case AVCOL_SPC_YCGCO:
    case AVCOL_SPC_BT2020_NCL:
      return true;
    default:
      return false;
  }
}

// yuvj420p and its relatives say "full range" by their name.
bool is_full_range_format(AVPixelFormat format) {
  switch (format) {
    case AV_PIX_FMT_YUVJ411P:
    case AV_PIX_FMT_YUVJ420P:
    case AV_PIX_FMT_YUVJ422P:
    case AV_PIX_FMT_YUVJ440P:
    case AV_PIX_FMT_YUVJ444P:
      return true;
    default:
      return false;
  }
}

}  // namespace

bool SampleMeaning::is_library_color() const {
  return range == AVCOL_RANGE_JPEG &&
         (matrix == AVCOL_SPC_SMPTE170M || matrix == AVCOL_SPC_BT470BG);
}

SampleMeaning meaning_of(const AVFrame& frame, bool is_picture) {
  const AVPixelFormat pixel_format = static_cast<AVPixelFormat>(frame.format);
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  const AVChromaLocation guessed_siting = is_picture ? AVCHROMA_LOC_CENTER : AVCHROMA_LOC_LEFT;
  if (format.flags & (AV_PIX_FMT_FLAG_RGB | AV_PIX_FMT_FLAG_PAL)) {
    return {AVCOL_RANGE_JPEG, AVCOL_SPC_RGB, guessed_siting};
  }
  SampleMeaning meaning = {frame.color_range, frame.colorspace, frame.chroma_location};
  const bool is_grey = format.nb_components < 3;
  if (is_full_range_format(pixel_format)) {
    meaning.range = AVCOL_RANGE_JPEG;
  } else if (meaning.range == AVCOL_RANGE_UNSPECIFIED) {
    meaning.range = is_grey && is_picture ? AVCOL_RANGE_JPEG : AVCOL_RANGE_MPEG;
  }
  if (!is_usable(meaning.matrix)) {
    meaning.matrix = is_picture || meaning.range == AVCOL_RANGE_JPEG
                         ? AVCOL_SPC_SMPTE170M
                         : guessed_video_matrix(frame.width, frame.height);
  }
  if (meaning.siting == AVCHROMA_LOC_UNSPECIFIED) meaning.siting = guessed_siting;
  return meaning;
}

AVColorSpace guessed_video_matrix(int width, int height) {
  return width >= 1280 || height > 576 ? AVCOL_SPC_BT709 : AVCOL_SPC_SMPTE170M;
}

int bits_per_sample(AVPixelFormat pixel_format) {
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  int bits = 0;
  for (int i = 0; i < format.nb_components; ++i) bits = std::max(bits, format.comp[i].depth);
  return bits;
}

bool is_floating_point(AVPixelFormat pixel_format) {
  return (av_pix_fmt_desc_get(pixel_format)->flags & AV_PIX_FMT_FLAG_FLOAT) != 0;
}

bool is_420(AVPixelFormat pixel_format) {
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  return format.log2_chroma_w == 1 && format.log2_chroma_h == 1;
}

}  // namespace dehaze
