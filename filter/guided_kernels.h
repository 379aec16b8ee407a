// Kernels of the guided filter's pixel-wise steps.
#pragma once

#include <math.h>
#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"

namespace haze::filter {

inline constexpr float kGuidedEpsilon = 1e-4f;

// Slope of the local linear model. The denominator is the second moment of the filtered plane less
// the squared mean of the guide. Of both parts the size is taken, so the slope is not negative.
inline float slope_of(float covariance, float variance) {
  const float slope = static_cast<float>(
      static_cast<double>(fabsf(covariance)) /
      (static_cast<double>(fabsf(variance)) + static_cast<double>(kGuidedEpsilon)));
  return slope > 1.0f ? 1.0f : slope;
}

// 200 v - 40, cut at 158 above and 0 below; what is not a number gives 0.
inline uint8_t code_of(float value) {
  if (static_cast<double>(value) > 0.99) return 158;
  const float code = 200.0f * value - 40.0f;
  return static_cast<uint8_t>(code > 0.0f ? code : 0.0f);
}

// The model of each pixel in [begin, end) takes the place of its moments: slopes that of the means
// of products, offsets that of the means of squares.
inline void fit_model_portable(const float* mean_guide, const float* mean_plane, float* products,
                               float* squares, size_t begin, size_t end) {
  for (size_t i = begin; i < end; ++i) {
    const float slope = slope_of(products[i] - mean_guide[i] * mean_plane[i],
                                 squares[i] - mean_guide[i] * mean_guide[i]);
    squares[i] = mean_plane[i] - slope * mean_guide[i];
    products[i] = slope;
  }
}

// Codes of the refined plane, which never falls below the guide.
inline void refined_codes_portable(const float* guide, const float* mean_slopes,
                                   const float* mean_offsets, uint8_t* codes, size_t begin,
                                   size_t end) {
  for (size_t i = begin; i < end; ++i) {
    const float refined = mean_offsets[i] + guide[i] * mean_slopes[i];
    codes[i] = code_of(guide[i] <= refined ? refined : guide[i]);
  }
}

#if HAZE_X86
// Same results; each returns the first pixel that it did not write.
size_t fit_model_avx2(const float* mean_guide, const float* mean_plane, float* products,
                      float* squares, float epsilon, size_t end);
size_t fit_model_avx512(const float* mean_guide, const float* mean_plane, float* products,
                        float* squares, float epsilon, size_t end);
size_t refined_codes_avx2(const float* guide, const float* mean_slopes, const float* mean_offsets,
                          uint8_t* codes, size_t end);
size_t refined_codes_avx512(const float* guide, const float* mean_slopes, const float* mean_offsets,
                            uint8_t* codes, size_t end);
#endif

inline void fit_model(const float* mean_guide, const float* mean_plane, float* products,
                      float* squares, size_t count) {
  size_t done = 0;
#if HAZE_X86
  if (const auto kernel = x86_kernel(fit_model_avx2, fit_model_avx512))
    done = kernel(mean_guide, mean_plane, products, squares, kGuidedEpsilon, count);
#endif
  fit_model_portable(mean_guide, mean_plane, products, squares, done, count);
}

inline void refined_codes(const float* guide, const float* mean_slopes, const float* mean_offsets,
                          uint8_t* codes, size_t count) {
  size_t done = 0;
#if HAZE_X86
  if (const auto kernel = x86_kernel(refined_codes_avx2, refined_codes_avx512))
    done = kernel(guide, mean_slopes, mean_offsets, codes, count);
#endif
  refined_codes_portable(guide, mean_slopes, mean_offsets, codes, done, count);
}

}  // namespace haze::filter
