#include "show.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>

namespace dehaze {
namespace {

constexpr int kNoColor = 128;
constexpr int kWhite = 255;

// The line between the halves, in luma samples. Both are even, so that it covers whole chroma
// samples.
struct Divider {
  explicit Divider(int frame_width)
      : width(std::min(2 * (frame_width / 640 + 1), frame_width / 2)),
        begin((frame_width - width) / 4 * 2) {}

  int width;
  int begin;
};

void split_row(const uint8_t* before, uint8_t* row, const Divider& divider, int divider_value) {
  const size_t begin = static_cast<size_t>(divider.begin);
  std::memcpy(row, before, begin);
  std::memset(row + begin, divider_value, static_cast<size_t>(divider.width));
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
  const Divider divider(frame.width);
  const size_t luma_rows = static_cast<size_t>(frame.height);
  for (size_t y = 0; y < luma_rows + luma_rows / 2; ++y) {
    split_row(&before.bytes[y * width], &frame.bytes[y * width], divider,
              y < luma_rows ? kWhite : kNoColor);
  }
}

void draw_compare_gain(std::vector<float>& gain, int frame_width) {
  const Divider divider(frame_width);
  for (auto row = gain.begin(); row != gain.end(); row += frame_width / 2) {
    std::fill_n(row, divider.begin / 2, 1.0F);
    std::fill_n(row + divider.begin / 2, divider.width / 2, 0.0F);
  }
}

std::string describe(const HazeFindings& findings) {
  char text[128];
  std::snprintf(text, sizeof(text), "light %.0f %.0f %.0f strength %.0f", findings.light_red,
                findings.light_green, findings.light_blue, findings.strength);
  return text;
}

}  // namespace dehaze
