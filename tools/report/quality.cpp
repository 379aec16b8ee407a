#include "report/quality.h"

#include "errors.h"

namespace dehaze {

RgbPicture picture_of(const AVFrame& rgb) {
  if (rgb.format != AV_PIX_FMT_RGB24) throw Error("internal error: not an RGB frame");
  RgbPicture picture;
  picture.width = rgb.width;
  picture.height = rgb.height;
  const ptrdiff_t row_bytes = static_cast<ptrdiff_t>(rgb.width) * 3;
  picture.bytes.reserve(static_cast<size_t>(row_bytes) * static_cast<size_t>(rgb.height));
  for (int y = 0; y < rgb.height; ++y) {
    const uint8_t* row = rgb.data[0] + static_cast<ptrdiff_t>(y) * rgb.linesize[0];
    picture.bytes.insert(picture.bytes.end(), row, row + row_bytes);
  }
  return picture;
}

Quality quality_of(const RgbPicture& picture, const RgbPicture& clear) {
  return {psnr_rgb(clear, picture), ssim_luma(clear, picture), mean_ciede2000(clear, picture),
          mean_hue_shift(clear, picture)};
}

}  // namespace dehaze
