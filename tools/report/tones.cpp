#include "report/tones.h"

#include <algorithm>
#include <cmath>

namespace dehaze {
namespace {

// round(1000 x 0.299, 0.587, 0.114), with a sum of 1000: white stays 255.
int luma_of(int red, int green, int blue) {
  return (299 * red + 587 * green + 114 * blue + 500) / 1000;
}

}  // namespace

Tones tones_of(const RgbPicture& picture) {
  Tones tones;
  const size_t pixels = picture.bytes.size() / 3;
  for (size_t i = 0; i < pixels; ++i) {
    const uint8_t* rgb = &picture.bytes[i * 3];
    ++tones.red[rgb[0]];
    ++tones.green[rgb[1]];
    ++tones.blue[rgb[2]];
    ++tones.luma[static_cast<size_t>(luma_of(rgb[0], rgb[1], rgb[2]))];
  }
  double sum = 0;
  double squares = 0;
  for (size_t value = 0; value < tones.luma.size(); ++value) {
    const double weighted = static_cast<double>(value) * static_cast<double>(tones.luma[value]);
    sum += weighted;
    squares += weighted * static_cast<double>(value);
  }
  const double count = static_cast<double>(pixels);
  tones.mean = sum / count;
  // Rounding may leave a flat picture a hair below zero.
  tones.deviation = std::sqrt(std::max(0.0, squares / count - tones.mean * tones.mean));
  tones.clipped = clipped_share(picture);
  return tones;
}

}  // namespace dehaze
