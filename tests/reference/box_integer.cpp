#include "tests/reference/box_integer.h"

#include <algorithm>
#include <cstddef>

namespace haze::reference {
namespace {

struct Range {
  int first;
  int last;
  int count() const { return last - first + 1; }
};

Range window_range(int center, int size, BoxWindow window) {
  return {std::max(center - window.before, 0), std::min(center + window.after, size - 1)};
}

}  // namespace

void box_mean_by_windows(const uint8_t* src, uint8_t* dst, int width, int height,
                         BoxWindow window) {
  for (int y = 0; y < height; ++y) {
    const Range rows = window_range(y, height, window);
    for (int x = 0; x < width; ++x) {
      const Range columns = window_range(x, width, window);
      int64_t sum = 0;
      for (int row = rows.first; row <= rows.last; ++row)
        for (int column = columns.first; column <= columns.last; ++column)
          sum += src[row * width + column];
      dst[y * width + x] =
          static_cast<uint8_t>(sum / (static_cast<int64_t>(rows.count()) * columns.count()));
    }
  }
}

void box_mean(const uint8_t* src, uint8_t* dst, int width, int height, BoxWindow window) {
  // above[y][x] is the sum of column x over the rows before row y.
  std::vector<int> above(static_cast<size_t>(width) * static_cast<size_t>(height + 1), 0);
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x)
      above[static_cast<size_t>((y + 1) * width + x)] =
          above[static_cast<size_t>(y * width + x)] + src[y * width + x];

  // left[x] is the sum of the window's rows over the columns to the left of column x.
  std::vector<int64_t> left(static_cast<size_t>(width) + 1, 0);
  for (int y = 0; y < height; ++y) {
    const Range rows = window_range(y, height, window);
    const int* bottom = &above[static_cast<size_t>((rows.last + 1) * width)];
    const int* top = &above[static_cast<size_t>(rows.first * width)];
    for (int x = 0; x < width; ++x)
      left[static_cast<size_t>(x) + 1] = left[static_cast<size_t>(x)] + (bottom[x] - top[x]);
    for (int x = 0; x < width; ++x) {
      const Range columns = window_range(x, width, window);
      const int64_t sum =
          left[static_cast<size_t>(columns.last) + 1] - left[static_cast<size_t>(columns.first)];
      dst[y * width + x] =
          static_cast<uint8_t>(sum / (static_cast<int64_t>(rows.count()) * columns.count()));
    }
  }
}

std::vector<int> box_column_sums_at_end(const uint8_t* src, int width, int height,
                                        BoxWindow window) {
  const Range rows = window_range(height - 1, height, window);
  std::vector<int> sums(static_cast<size_t>(width), 0);
  for (int row = rows.first; row <= rows.last; ++row)
    for (int x = 0; x < width; ++x) sums[static_cast<size_t>(x)] += src[row * width + x];
  return sums;
}

}  // namespace haze::reference
