#include "bench/images.h"

#include <algorithm>
#include <cstdlib>

namespace haze::bench {
namespace {

class Noise {
 public:
  // -amplitude ... amplitude
  int next(int amplitude) {
    state_ = state_ * 1664525u + 1013904223u;
    return static_cast<int>(state_ >> 16) % (2 * amplitude + 1) - amplitude;
  }

 private:
  uint32_t state_ = 1;
};

uint8_t to_byte(double value) { return static_cast<uint8_t>(std::clamp(value, 0.0, 255.0)); }

// Transmission by row: dense haze at the top.
double transmission_at(int y, Size size) { return 0.4 + 0.58 * y / size.height; }

double clear_at(int x, int y, int channel) {
  return std::abs((x * 7 + channel * 31) % 97 - 48) * 3 + (y / 16 % 2 != 0 ? 60 : 10);
}

}  // namespace

Bytes hazy_image(Size size, int channels) {
  Noise noise;
  Bytes image;
  image.reserve(area(size) * static_cast<size_t>(channels));
  for (int y = 0; y < size.height; ++y) {
    const double t = transmission_at(y, size);
    for (int x = 0; x < size.width; ++x)
      for (int c = 0; c < channels; ++c)
        image.push_back(to_byte(clear_at(x, y, c) * t + 210 * (1 - t) + noise.next(3)));
  }
  return image;
}

Bytes hazy_frame(Size size) {
  Bytes frame = hazy_image(size, 1);
  Noise noise;
  for (size_t i = area(size) / 2; i > 0; --i)
    frame.push_back(static_cast<uint8_t>(128 + noise.next(20)));
  return frame;
}

std::vector<float> float_plane(Size size) {
  std::vector<float> plane;
  for (uint8_t byte : hazy_image(size, 1)) plane.push_back(static_cast<float>(byte) / 255.0f);
  return plane;
}

std::vector<float> transmission_plane(Size size) {
  std::vector<float> plane;
  for (uint8_t code : code_map(size)) plane.push_back(static_cast<float>(code + 40) / 200.0f);
  return plane;
}

Bytes code_map(Size size) {
  Noise noise;
  Bytes codes;
  for (int y = 0; y < size.height; ++y)
    for (int x = 0; x < size.width; ++x)
      codes.push_back(static_cast<uint8_t>(
          std::clamp(200 * transmission_at(y, size) - 40 + noise.next(5), 40.0, 158.0)));
  return codes;
}

}  // namespace haze::bench
