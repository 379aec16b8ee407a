#include "tests/reference/min_filter.h"

#include <algorithm>
#include <cstddef>

namespace haze::reference {
namespace {

size_t at(int i) { return static_cast<size_t>(i); }

// Minimum of the samples around number i of a line whose samples are `step` bytes apart.
uint8_t windowed(const uint8_t* line, int count, int step, int i, int radius) {
  const int first = i > radius ? i - radius : 0;
  const int last = count - 1 - i > radius ? i + radius : count - 1;
  uint8_t least = 255;
  for (int k = first; k <= last; ++k) least = std::min(least, line[k * step]);
  return least;
}

}  // namespace

std::vector<uint8_t> line_minimum(const uint8_t* line, int count, int radius) {
  return row_minimum(line, count, 1, radius);
}

std::vector<uint8_t> row_minimum(const uint8_t* image, int width, int height, int radius) {
  std::vector<uint8_t> result(at(width * height));
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x)
      result[at(y * width + x)] = windowed(image + y * width, width, 1, x, radius);
  return result;
}

std::vector<uint8_t> column_minimum(const uint8_t* image, int width, int height, int radius) {
  std::vector<uint8_t> result(at(width * height));
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x)
      result[at(y * width + x)] = windowed(image + x, height, width, y, radius);
  return result;
}

std::vector<uint8_t> square_minimum(const uint8_t* image, int width, int height, int radius) {
  const std::vector<uint8_t> rows = row_minimum(image, width, height, radius);
  return column_minimum(rows.data(), width, height, radius);
}

std::vector<int> histogram_of(const uint8_t* bytes, int count) {
  std::vector<int> bins(256);
  for (int i = 0; i < count; ++i) ++bins[bytes[i]];
  return bins;
}

std::vector<int> histogram_of_columns(const uint8_t* image, int width, int height, int first,
                                      int count) {
  std::vector<int> bins(256);
  for (int y = 0; y < height; ++y)
    for (int x = first; x < first + count; ++x) ++bins[image[y * width + x]];
  return bins;
}

}  // namespace haze::reference
