// Float transmission of a colour image with a known light, smoothed by a maximum filter: the
// complement of the scaled dark channel of the image over its light.
#include "core/image_size.h"
#include "core/scratch.h"
#include "filter/window_extremum.h"
#include "haze_preview.h"

namespace {

using haze::filter::MostFloat;

// Share of the haze that is taken away, by level.
constexpr float kStrengths[10] = {0.0f, 0.1f, 0.2f, 0.3f, 0.4f, 0.5f, 0.6f, 0.7f, 0.8f, 0.9f};
constexpr float kDefaultStrength = 0.3f;
constexpr float kLeastTransmission = 0.4f;
constexpr int kRadius = 7;

float strength_of(int level) {
  return level >= 0 && level <= 9 ? kStrengths[level] : kDefaultStrength;
}

// Transmission of one channel by its byte. A light of 0 gives the least transmission but for a byte
// of 0, which is not a number.
struct ChannelTable {
  float values[256];

  ChannelTable(float strength, uint8_t light) {
    const float scale = strength / static_cast<float>(light);
    for (int byte = 0; byte < 256; ++byte) {
      const float t = 1.0f - scale * static_cast<float>(byte);
      values[byte] = t > 1.0f ? 1.0f : t < kLeastTransmission ? kLeastTransmission : t;
    }
  }
};

float larger(float a, float b) { return a < b ? b : a; }

}  // namespace

void EstimateTPreview(unsigned char* src, unsigned char* A, float* t, float* tRaw, int w, int h,
                      int level) {
  const size_t count = haze::pixel_count(w, h);
  haze::Scratch<float> rows(count);
  if (count == 0 || !rows) return;
  const float strength = strength_of(level);
  const ChannelTable first(strength, A[0]);
  const ChannelTable second(strength, A[1]);
  const ChannelTable third(strength, A[2]);
  for (size_t i = 0; i < count; ++i) {
    tRaw[i] = larger(larger(first.values[src[3 * i]], second.values[src[3 * i + 1]]),
                     third.values[src[3 * i + 2]]);
  }
  if (haze::filter::filter_rows<MostFloat>(tRaw, rows.data(), w, h, w, kRadius))
    haze::filter::filter_columns<MostFloat>(rows.data(), t, w, h, w, kRadius);
}
