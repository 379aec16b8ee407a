#include "tests/reference/atmospheric_light.h"

namespace haze::reference {

int brightest_populated_bin(const int* histogram, int pixels) {
  const int target = static_cast<int>(static_cast<double>(pixels) * 0.001);
  // The last bin of the range: the first one, from the top, at which the count reaches the target.
  int last = 255;
  for (int count = histogram[255]; count < target && last > 0;) count += histogram[--last];
  int chosen = last;
  for (int bin = last; bin < 256; ++bin)
    if (histogram[bin] >= histogram[chosen]) chosen = bin;
  return chosen;
}

std::array<uint8_t, 3> estimate_light(const uint8_t* dark, const uint8_t* image,
                                      const int* histogram, int width, int height) {
  const int pixels = width * height;
  const int bin = brightest_populated_bin(histogram, pixels);
  int sums[3] = {};
  int count = 0;
  for (int i = 0; i < pixels; ++i) {
    if (dark[i] != bin) continue;
    ++count;
    for (int c = 0; c < 3; ++c) sums[c] += image[3 * i + c];
  }
  if (count == 0) return {255, 255, 255};
  return {static_cast<uint8_t>(sums[0] / count), static_cast<uint8_t>(sums[1] / count),
          static_cast<uint8_t>(sums[2] / count)};
}

uint32_t sampled_sum(const uint8_t* plane, int width, int height, int stripe) {
  uint32_t sum = 0;
  for_each_sample(width, height, stripe, [&](size_t position) { sum += plane[position]; });
  return sum;
}

uint8_t sampled_maximum(const uint8_t* plane, int width, int height, int stripe) {
  uint8_t greatest = 0;
  for_each_sample(width, height, stripe, [&](size_t position) {
    if (plane[position] > greatest) greatest = plane[position];
  });
  return greatest;
}

}  // namespace haze::reference
