// Float transmission of a colour image with a known light, smoothed by a maximum filter: the
// complement of the scaled dark channel of the image over its light.
#include "core/image_size.h"
#include "core/scratch.h"
#include "estimate/float_transmission_kernels.h"
#include "filter/window_extremum.h"
#include "haze_preview.h"

namespace {

using haze::filter::MostNormalFloat;

// Share of the haze that is taken away, by level.
constexpr float kStrengths[10] = {0.0f, 0.1f, 0.2f, 0.3f, 0.4f, 0.5f, 0.6f, 0.7f, 0.8f, 0.9f};
constexpr float kDefaultStrength = 0.3f;
constexpr int kRadius = 7;

float strength_of(int level) {
  return level >= 0 && level <= 9 ? kStrengths[level] : kDefaultStrength;
}

// Transmission of one channel by its byte. A light of 0 gives the least transmission but for a byte
// of 0, which is not a number.
struct ChannelTable {
  float values[256];

  explicit ChannelTable(float scale) {
    for (int byte = 0; byte < 256; ++byte)
      values[byte] = haze::estimate::clamped_transmission(scale, static_cast<uint8_t>(byte));
  }
};

float larger(float a, float b) { return a < b ? b : a; }

// t[i] = the largest transmission of the channels of pixel i.
void largest_transmissions(const uint8_t* pixels, const float (&scales)[3], float* t,
                           size_t count) {
  size_t i = 0;
#if HAZE_NEON
  i = haze::estimate::largest_transmissions_neon(pixels, scales, t, count);
#elif HAZE_X86
  if (const auto kernel = haze::x86_kernel(haze::estimate::largest_transmissions_avx2,
                                           haze::estimate::largest_transmissions_avx512))
    i = kernel(pixels, scales, haze::estimate::kLeastFloatTransmission, t, count);
#endif
  if (i == count) return;
  const ChannelTable first(scales[0]);
  const ChannelTable second(scales[1]);
  const ChannelTable third(scales[2]);
  for (; i < count; ++i) {
    t[i] = larger(larger(first.values[pixels[3 * i]], second.values[pixels[3 * i + 1]]),
                  third.values[pixels[3 * i + 2]]);
  }
}

}  // namespace

void EstimateTPreview(unsigned char* src, unsigned char* A, float* t, float* tRaw, int w, int h,
                      int level) {
  const size_t count = haze::pixel_count(w, h);
  if (count == 0) return;
  // All memory at first, so that either both maps are written or none.
  haze::Scratch<float> rows(count);
  haze::filter::WindowLines<MostNormalFloat> line(w, kRadius, 1);
  haze::filter::WindowLines<MostNormalFloat> columns(
      h, kRadius, haze::filter::column_bundle<MostNormalFloat>(w));
  if (!rows || !line || !columns) return;
  const float strength = strength_of(level);
  float scales[3];
  for (int channel = 0; channel < 3; ++channel)
    scales[channel] = strength / static_cast<float>(A[channel]);
  largest_transmissions(src, scales, tRaw, count);
  haze::filter::filter_rows(line, tRaw, rows.data(), w, h, w);
  haze::filter::filter_columns(columns, rows.data(), t, w, h, w);
}
