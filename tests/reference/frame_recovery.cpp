#include "tests/reference/frame_recovery.h"

#include <cstddef>

#include "tests/reference/tone_curve.h"

namespace haze::reference {
namespace {

int clamp_and_truncate(float x) {
  if (x > 255.0f) return 255;
  if (x < 0.0f) return 0;
  return static_cast<int>(x);
}

int recover(uint8_t value, int light, float factor) {
  const float difference = static_cast<float>(value) - static_cast<float>(light);
  const float product = difference * factor;
  return clamp_and_truncate(static_cast<float>(light) + product);
}

// Truncates; a negative value gives 0. No light byte triple leads to 256 or more.
int truncate_to_byte(double x) { return x < 0.0 ? 0 : static_cast<int>(x); }

enum class Chroma { kInterleavedVu, kPlanarUThenV };

void recover_frame(uint8_t* frame, const uint8_t* codes, const uint8_t* light_bgr, int width,
                   int height, Chroma layout) {
  const LightYuv light = light_to_yuv(light_bgr);
  const int half_width = width / 2;
  uint8_t* chroma = frame + static_cast<ptrdiff_t>(width) * height;
  const int quarter = width * height / 4;
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const float factor = recovery_factor(codes[(y / 2) * half_width + x / 2]);
      uint8_t& sample = frame[y * width + x];
      sample = recover_luma(sample, light.y, factor);
    }
  for (int i = 0; i < height / 2; ++i)
    for (int j = 0; j < half_width; ++j) {
      const float factor = recovery_factor(codes[i * half_width + j]);
      const bool interleaved = layout == Chroma::kInterleavedVu;
      uint8_t& v = interleaved ? chroma[i * width + 2 * j] : chroma[quarter + i * half_width + j];
      uint8_t& u = interleaved ? chroma[i * width + 2 * j + 1] : chroma[i * half_width + j];
      v = recover_chroma(v, light.v, factor);
      u = recover_chroma(u, light.u, factor);
    }
}

}  // namespace

LightYuv light_to_yuv(const uint8_t* light_bgr) {
  const int b = light_bgr[0];
  const int g = light_bgr[1];
  const int r = light_bgr[2];
  const double green = g * 0.587;
  const double blue = b * 0.114;
  const double red = r * 0.299;
  double sum = green + blue;
  sum = sum + red;
  const int y = truncate_to_byte(sum);
  const double u_offset = (b - y) * 0.564;
  const double v_offset = (r - y) * 0.713;
  return {y, truncate_to_byte(128.0 + u_offset), truncate_to_byte(128.0 + v_offset)};
}

float recovery_factor(int code) { return static_cast<float>(200.0 / (code + 40)); }

uint8_t recover_luma(uint8_t value, int light_y, float factor) {
  return kToneCurve[recover(value, light_y, factor)];
}

uint8_t recover_chroma(uint8_t value, int light_chroma, float factor) {
  return static_cast<uint8_t>(recover(value, light_chroma, factor));
}

void recover_nv21(uint8_t* frame, const uint8_t* codes, const uint8_t* light_bgr, int width,
                  int height) {
  recover_frame(frame, codes, light_bgr, width, height, Chroma::kInterleavedVu);
}

void recover_planar(uint8_t* frame, const uint8_t* codes, const uint8_t* light_bgr, int width,
                    int height) {
  recover_frame(frame, codes, light_bgr, width, height, Chroma::kPlanarUThenV);
}

}  // namespace haze::reference
