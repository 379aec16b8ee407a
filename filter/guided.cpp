// Guided filter on float planes, after the guided-filter paper of 2010, with transmission codes as
// output.
#include <math.h>
#include <stdint.h>

#include "core/image_size.h"
#include "core/scratch.h"
#include "haze_preview.h"

namespace {

constexpr float kEpsilon = 1e-4f;

// Slope of the local linear model. The denominator is the second moment of the filtered plane less
// the squared mean of the guide. Of both parts the size is taken, so the slope is not negative.
float slope_of(float covariance, float variance) {
  const float slope =
      static_cast<float>(static_cast<double>(fabsf(covariance)) /
                         (static_cast<double>(fabsf(variance)) + static_cast<double>(kEpsilon)));
  return slope > 1.0f ? 1.0f : slope;
}

// 200 v - 40, cut at 158 above and 0 below; what is not a number gives 0.
uint8_t code_of(float value) {
  if (static_cast<double>(value) > 0.99) return 158;
  const float code = 200.0f * value - 40.0f;
  return static_cast<uint8_t>(code > 0.0f ? code : 0.0f);
}

}  // namespace

void GuidedFilterPreview(float* p, float* I, unsigned char* out, int w, int h, int r) {
  if (!haze::holds_window(w, h, r)) return;
  const size_t count = haze::pixel_count(w, h);
  haze::Scratch<float> planes(4 * count);
  if (!planes) return;
  float* const mean_guide = planes.data();
  float* const mean_plane = mean_guide + count;
  float* const mean_product = mean_plane + count;
  float* const mean_square = mean_product + count;
  AverageFilter_f_Out4Preview(I, p, mean_guide, mean_plane, mean_product, mean_square, w, h, r);

  // The model of each pixel takes the place of its moments.
  float* const slopes = mean_product;
  float* const offsets = mean_square;
  for (size_t i = 0; i < count; ++i) {
    const float slope = slope_of(mean_product[i] - mean_guide[i] * mean_plane[i],
                                 mean_square[i] - mean_guide[i] * mean_guide[i]);
    offsets[i] = mean_plane[i] - slope * mean_guide[i];
    slopes[i] = slope;
  }
  float* const mean_slopes = mean_guide;
  float* const mean_offsets = mean_plane;
  AverageFilter_f_Out2Preview(slopes, offsets, mean_slopes, mean_offsets, w, h, r);

  for (size_t i = 0; i < count; ++i) {
    const float refined = mean_offsets[i] + I[i] * mean_slopes[i];
    out[i] = code_of(I[i] <= refined ? refined : I[i]);
  }
}
