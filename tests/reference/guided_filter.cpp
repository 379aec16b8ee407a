#include "tests/reference/guided_filter.h"

#include <cmath>
#include <cstddef>

#include "tests/reference/box_float.h"

namespace haze::reference {

float guided_slope(float mean_guide, float mean_plane, float mean_product,
                   float mean_plane_square) {
  const float mean_product_of_means = mean_guide * mean_plane;
  const float covariance = mean_product - mean_product_of_means;
  const float squared_mean = mean_guide * mean_guide;
  const float variance = mean_plane_square - squared_mean;
  const double epsilon = static_cast<double>(1e-4f);
  const double divisor = static_cast<double>(std::fabs(variance)) + epsilon;
  const float slope = static_cast<float>(static_cast<double>(std::fabs(covariance)) / divisor);
  return slope > 1.0f ? 1.0f : slope;
}

uint8_t guided_code(float value) {
  if (static_cast<double>(value) > 0.99) return 158;
  const float scaled = value * 200.0f;
  const float code = scaled - 40.0f;
  if (!(code > 0.0f)) return 0;
  return static_cast<uint8_t>(code);
}

std::vector<uint8_t> guided_filter(const float* plane, const float* guide, int width, int height,
                                   int radius) {
  const auto mean = [&](const float* a, const float* b, Averaged quantity) {
    return box_mean_float(a, b, quantity, width, height, radius);
  };
  const std::vector<float> mean_guide = mean(guide, plane, Averaged::kFirst);
  const std::vector<float> mean_plane = mean(guide, plane, Averaged::kSecond);
  const std::vector<float> mean_product = mean(guide, plane, Averaged::kProduct);
  const std::vector<float> mean_square = mean(guide, plane, Averaged::kSecondSquared);
  std::vector<float> slopes;
  std::vector<float> offsets;
  for (size_t i = 0; i < mean_guide.size(); ++i) {
    const float slope = guided_slope(mean_guide[i], mean_plane[i], mean_product[i], mean_square[i]);
    const float explained = slope * mean_guide[i];
    slopes.push_back(slope);
    offsets.push_back(mean_plane[i] - explained);
  }
  const std::vector<float> mean_slope = mean(slopes.data(), offsets.data(), Averaged::kFirst);
  const std::vector<float> mean_offset = mean(slopes.data(), offsets.data(), Averaged::kSecond);
  std::vector<uint8_t> codes;
  for (size_t i = 0; i < mean_slope.size(); ++i) {
    const float product = guide[i] * mean_slope[i];
    const float filtered = mean_offset[i] + product;
    codes.push_back(guided_code(guide[i] <= filtered ? filtered : guide[i]));
  }
  return codes;
}

}  // namespace haze::reference
