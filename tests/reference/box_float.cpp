#include "tests/reference/box_float.h"

#include <algorithm>
#include <cstddef>

namespace haze::reference {
namespace {

float quantity_of(const float* a, const float* b, Averaged quantity, size_t i) {
  switch (quantity) {
    case Averaged::kFirst:
      return a[i];
    case Averaged::kSecond:
      return b[i];
    case Averaged::kProduct:
      return a[i] * b[i];
    case Averaged::kSecondSquared:
      break;
  }
  return b[i] * b[i];
}

size_t at(int x) { return static_cast<size_t>(x); }

// Means of one output row from the sums of its columns.
void average_row(const std::vector<float>& columns, int rows, int radius, float* out) {
  const int width = static_cast<int>(columns.size());
  float sum = columns[0];
  for (int x = 1; x < radius; ++x) sum += columns[at(x)];
  for (int x = 0; x < width; ++x) {
    int count = 2 * radius + 1;
    if (x <= radius) {
      sum += columns[at(x + radius)];
      count = x + radius + 1;
    } else if (x < width - radius) {
      const float change = columns[at(x + radius)] - columns[at(x - radius - 1)];
      sum += change;
    } else {
      sum -= columns[at(x - radius - 1)];
      count = width - x + radius;
    }
    out[x] = sum / static_cast<float>(rows * count);
  }
}

}  // namespace

std::vector<float> box_mean_float(const float* a, const float* b, Averaged quantity, int width,
                                  int height, int radius) {
  const auto sample = [&](int x, int y) {
    return quantity_of(a, b, quantity, at(y) * at(width) + at(x));
  };
  std::vector<float> means(at(width) * at(height));
  std::vector<float> columns(at(width));
  for (int x = 0; x < width; ++x) columns[at(x)] = sample(x, 0);
  for (int y = 1; y < radius; ++y)
    for (int x = 0; x < width; ++x) columns[at(x)] += sample(x, y);
  for (int y = 0; y < height; ++y) {
    const int entering = y + radius;
    const int leaving = y - radius - 1;
    int rows = 2 * radius + 1;
    if (y <= radius) {
      rows = y + radius + 1;
      for (int x = 0; x < width; ++x) columns[at(x)] += sample(x, entering);
    } else if (y < height - radius) {
      for (int x = 0; x < width; ++x) {
        const float change = sample(x, entering) - sample(x, leaving);
        columns[at(x)] += change;
      }
    } else {
      rows = height - y + radius;
      for (int x = 0; x < width; ++x) columns[at(x)] -= sample(x, leaving);
    }
    average_row(columns, rows, radius, &means[at(y) * at(width)]);
  }
  return means;
}

std::vector<double> box_mean_by_windows(const float* a, const float* b, Averaged quantity,
                                        int width, int height, int radius) {
  std::vector<double> means;
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      double sum = 0.0;
      int count = 0;
      for (int v = std::max(0, y - radius); v <= std::min(height - 1, y + radius); ++v)
        for (int u = std::max(0, x - radius); u <= std::min(width - 1, x + radius); ++u) {
          sum += static_cast<double>(quantity_of(a, b, quantity, at(v) * at(width) + at(u)));
          ++count;
        }
      means.push_back(sum / count);
    }
  return means;
}

}  // namespace haze::reference
