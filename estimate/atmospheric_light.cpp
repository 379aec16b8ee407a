// Atmospheric light as the mean colour of a bright bin of the dark channel, after the
// dark-channel-prior paper of 2009.
#include <stdint.h>

#include "core/image_size.h"
#include "estimate/histogram.h"
#include "haze_preview.h"

namespace {

// Share of the pixels among whose bins the light is looked for.
constexpr double kBrightShare = 0.001;

// The most populated of the brightest bins that together hold `target` pixels; the brighter one of
// equals.
int brightest_populated_bin(const int* histogram, int target) {
  int chosen = haze::estimate::kBins - 1;
  int64_t count = histogram[chosen];
  for (int bin = chosen - 1; bin >= 0 && count < target; --bin) {
    count += histogram[bin];
    if (histogram[bin] > histogram[chosen]) chosen = bin;
  }
  return chosen;
}

// The sum, which wraps at 32 bits, is divided as a signed number; it wraps from 8 million pixels
// on. Double precision gives the same quotient: one that is no integer is 1 / count from the next
// one, and quotient * count stays far below 2^52. 32-bit ARM divides it in hardware.
uint8_t mean_byte(uint32_t sum, int32_t count) {
  if (count == 0) return 255;
  return static_cast<uint8_t>(static_cast<int32_t>(static_cast<double>(static_cast<int32_t>(sum)) /
                                                   static_cast<double>(count)));
}

}  // namespace

void EstimateAPreview(unsigned char* dark, unsigned char* img, int* hist, unsigned char* A, int w,
                      int h) {
  const size_t pixels = haze::pixel_count(w, h);
  if (pixels == 0) return;
  const int target = static_cast<int>(static_cast<double>(pixels) * kBrightShare);
  const int bin = brightest_populated_bin(hist, target);
  uint32_t sums[3] = {};
  int32_t count = 0;
  for (size_t i = 0; i < pixels; ++i) {
    if (dark[i] != bin) continue;
    for (size_t channel = 0; channel < 3; ++channel) sums[channel] += img[3 * i + channel];
    ++count;
  }
  for (int channel = 0; channel < 3; ++channel) A[channel] = mean_byte(sums[channel], count);
}
