#include "tests/reference/float_transmission.h"

#include <algorithm>
#include <cstddef>

namespace haze::reference {
namespace {

size_t at(int i) { return static_cast<size_t>(i); }

// The largest sample so far and where it was seen.
struct Running {
  float value;
  int position;

  void take(const float* line, int i) {
    if (!(line[i] >= value)) return;
    value = line[i];
    position = i;
  }
};

}  // namespace

std::vector<float> window_maximum(const float* line, int count, int radius) {
  std::vector<float> maxima;
  for (int i = 0; i < count; ++i) {
    const int first = i < radius ? 0 : i - radius;
    const int last = radius > count - 1 - i ? count - 1 : i + radius;
    float largest = line[first];
    for (int j = first + 1; j <= last; ++j)
      if (line[j] >= largest) largest = line[j];
    maxima.push_back(largest);
  }
  return maxima;
}

std::vector<float> carried_maximum(const float* line, int count, int radius) {
  std::vector<float> maxima(at(count));
  Running running = {line[0], 0};
  for (int j = 1; j <= radius; ++j) running.take(line, j);
  maxima[0] = running.value;
  for (int i = 1; i < count; ++i) {
    const int first = i - radius;
    const int last = std::min(i + radius, count - 1);
    if (i > radius && running.position < first) {
      running.value = line[first];
      for (int j = first + 1; j <= last; ++j) running.take(line, j);
    } else if (i + radius < count) {
      running.take(line, i + radius);
    }
    maxima[at(i)] = running.value;
  }
  return maxima;
}

std::vector<float> maximum_of_columns(const std::vector<float>& map, int width, int height,
                                      int radius, LineMaximum line_maximum) {
  std::vector<float> result(map.size());
  for (int x = 0; x < width; ++x) {
    std::vector<float> column;
    for (int y = 0; y < height; ++y) column.push_back(map[at(y * width + x)]);
    const std::vector<float> maxima = line_maximum(column.data(), height, radius);
    for (int y = 0; y < height; ++y) result[at(y * width + x)] = maxima[at(y)];
  }
  return result;
}

std::vector<float> maximum_of_rows(const std::vector<float>& map, int width, int height,
                                   int radius) {
  std::vector<float> result;
  for (int y = 0; y < height; ++y) {
    const std::vector<float> maxima = window_maximum(&map[at(y * width)], width, radius);
    result.insert(result.end(), maxima.begin(), maxima.end());
  }
  return result;
}

float haze_strength(int level) {
  switch (level) {
    case 0:
      return 0.0f;
    case 1:
      return 0.1f;
    case 2:
      return 0.2f;
    case 4:
      return 0.4f;
    case 5:
      return 0.5f;
    case 6:
      return 0.6f;
    case 7:
      return 0.7f;
    case 8:
      return 0.8f;
    case 9:
      return 0.9f;
    default:
      return 0.3f;
  }
}

float channel_transmission(uint8_t value, uint8_t light, float strength) {
  const float slope = strength / static_cast<float>(light);
  const float haze = slope * static_cast<float>(value);
  const float t = 1.0f - haze;
  if (t > 1.0f) return 1.0f;
  return t < 0.4f ? 0.4f : t;
}

std::vector<float> raw_transmission(const uint8_t* image, const uint8_t* light, int width,
                                    int height, int level) {
  const float strength = haze_strength(level);
  std::vector<float> raw;
  for (int i = 0; i < width * height; ++i) {
    const float first = channel_transmission(image[3 * i], light[0], strength);
    const float second = channel_transmission(image[3 * i + 1], light[1], strength);
    const float third = channel_transmission(image[3 * i + 2], light[2], strength);
    raw.push_back(std::max(first, std::max(second, third)));
  }
  return raw;
}

std::vector<float> filtered_transmission(const std::vector<float>& raw, int width, int height) {
  return maximum_of_columns(maximum_of_rows(raw, width, height, 7), width, height, 7);
}

}  // namespace haze::reference
