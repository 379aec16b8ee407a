#include "show.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>

namespace dehaze {
namespace {

constexpr int kNoColor = 128;
constexpr int kWhite = 255;

// Even, so that it covers whole chroma samples.
int divider_width(int width) { return 2 * (width / 640 + 1); }

void split_row(const uint8_t* before, uint8_t* row, size_t divider_begin, size_t divider_bytes,
               int divider_value) {
  std::memcpy(row, before, divider_begin);
  std::memset(row + divider_begin, divider_value, divider_bytes);
}

}  // namespace

void draw_map(const std::vector<float>& transmission, Nv21Frame& frame) {
  const size_t width = static_cast<size_t>(frame.width);
  const size_t columns = width / 2;
  const size_t rows = static_cast<size_t>(frame.height) / 2;
  uint8_t* luma = frame.bytes.data();
  for (size_t y = 0; y < rows; ++y) {
    uint8_t* upper = luma + 2 * y * width;
    for (size_t x = 0; x < columns; ++x) {
      const float grey = std::clamp(transmission[y * columns + x], 0.0F, 1.0F) * 255;
      upper[2 * x] = upper[2 * x + 1] = static_cast<uint8_t>(std::lround(grey));
    }
    std::memcpy(upper + width, upper, width);
  }
  std::memset(luma + 4 * columns * rows, kNoColor, 2 * columns * rows);
}

void draw_compare(const Nv21Frame& before, Nv21Frame& frame) {
  const size_t width = static_cast<size_t>(frame.width);
  const int divider = std::min(divider_width(frame.width), frame.width / 2);
  const int chroma_samples = (frame.width - divider) / 4;
  const size_t begin = static_cast<size_t>(chroma_samples) * 2;
  const size_t luma_rows = static_cast<size_t>(frame.height);
  for (size_t y = 0; y < luma_rows + luma_rows / 2; ++y) {
    split_row(&before.bytes[y * width], &frame.bytes[y * width], begin,
              static_cast<size_t>(divider), y < luma_rows ? kWhite : kNoColor);
  }
}

std::string describe(const HazeFindings& findings) {
  char text[128];
  std::snprintf(text, sizeof(text), "light %.0f %.0f %.0f strength %.0f", findings.light_red,
                findings.light_green, findings.light_blue, findings.strength);
  return text;
}

}  // namespace dehaze
