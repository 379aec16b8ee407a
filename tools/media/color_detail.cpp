#include "media/color_detail.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string>

#include "media/nv21.h"
#include "media/zscale.h"

namespace dehaze {

bool has_fine_color(AVPixelFormat pixel_format) {
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  const bool is_color = format.nb_components >= 3 || (format.flags & AV_PIX_FMT_FLAG_PAL) != 0;
  return is_color && format.log2_chroma_w + format.log2_chroma_h < 2;
}

FramePtr in_samples(const AVFrame& picture, const OutputSamples& samples) {
  FramePtr frame = without_range(picture);
  const AVPixelFormat format = static_cast<AVPixelFormat>(frame->format);
  const std::string plain = plain_format_filter(*frame);
  if (!plain.empty()) frame = run_filter(*frame, plain);
  frame = pad_to_even(*frame);
  std::string more = ":filter=lanczos";
  if (bits_per_sample(format) > 8) more += ":dither=error_diffusion";
  const std::string conversion = zscale(meaning_of(picture, true), samples.meaning, more);
  frame = run_filter(*frame, conversion + in_format(samples.format));
  frame->width = picture.width;
  frame->height = picture.height;
  set_samples(*frame, samples);
  return frame;
}

void add_color_detail(const AVFrame& fine, const AVFrame& coarse, const std::vector<float>& gain,
                      AVFrame& result) {
  const AVPixelFormat format = static_cast<AVPixelFormat>(result.format);
  const int planes = av_pix_fmt_count_planes(format);
  const int step = av_pix_fmt_desc_get(format)->comp[0].step;
  const ptrdiff_t blocks = (result.width + 1) / 2;
  for (int plane = 0; plane < planes; ++plane) {
    for (int y = 0; y < result.height; ++y) {
      const float* row_gain = gain.data() + y / 2 * blocks;
      const uint8_t* from = fine.data[plane] + ptrdiff_t{y} * fine.linesize[plane];
      const uint8_t* less = coarse.data[plane] + ptrdiff_t{y} * coarse.linesize[plane];
      uint8_t* row = result.data[plane] + ptrdiff_t{y} * result.linesize[plane];
      for (int x = 0; x < result.width; ++x) {
        for (int c = 0; c < step; ++c, ++from, ++less, ++row) {
          const float sum =
              static_cast<float>(*row) + row_gain[x / 2] * static_cast<float>(*from - *less);
          // NOLINTNEXTLINE(bugprone-incorrect-roundings): lround is a call for each sample
          *row = static_cast<uint8_t>(std::clamp(sum, 0.0F, 255.0F) + 0.5F);
        }
      }
    }
  }
}

}  // namespace dehaze
