#include "tests/reference/transmission.h"

#include <cmath>

namespace haze::reference {
namespace {

// Factors below the smallest normal number count as 0 in groups of eight.
float without_subnormals(float factor) {
  return std::fpclassify(factor) == FP_SUBNORMAL ? 0.0f : factor;
}

// A product past 32 bits wraps.
int wrapped_product(int a, int b) {
  constexpr int64_t kTwoTo32 = int64_t{1} << 32;
  int64_t rest = static_cast<int64_t>(a) * b % kTwoTo32;
  if (rest > INT32_MAX) rest -= kTwoTo32;
  if (rest < INT32_MIN) rest += kTwoTo32;
  return static_cast<int>(rest);
}

}  // namespace

uint8_t transmission_in_group(uint8_t mean, uint8_t min, float strength, float inv_light) {
  const float scaled = static_cast<float>(mean) * without_subnormals(strength);
  // A scaled mean that is not a number stays so: the comparison is false for it.
  const float m = static_cast<float>(min) < scaled ? static_cast<float>(min) : scaled;
  const float product = m * without_subnormals(inv_light);
  float t = 1.0f - product;
  if (std::isnan(t)) return 0;
  if (t < 0.4f) t = 0.4f;
  if (t > 0.99f) t = 0.99f;
  const float t200 = t * 200.0f;
  return static_cast<uint8_t>(static_cast<int>(t200 - 40.0f));
}

uint8_t transmission_in_tail(uint8_t mean, uint8_t min, float strength, float inv_light) {
  float m = static_cast<float>(mean) * strength;
  if (m > static_cast<float>(min)) m = static_cast<float>(min);
  const float product = m * inv_light;
  const float t = 1.0f - product;
  if (std::isnan(t)) return 40;
  if (static_cast<double>(t) <= 0.4) return 40;
  if (static_cast<double>(t) >= 0.99) return 158;
  const float t200 = t * 200.0f;
  return static_cast<uint8_t>(static_cast<unsigned>(t200 - 40.0f));
}

uint8_t transmission_q8(uint8_t mean, uint8_t min, int strength_q8, int light) {
  const int p = wrapped_product(strength_q8, mean);
  const int q = 256 * min;
  const int m = q < p ? q : p;
  const float quotient = static_cast<float>(m) / static_cast<float>(light);
  const float t = (256.0f - quotient) * 0.00390625f;
  if (std::isnan(t)) return 0;
  if (static_cast<double>(t) < 0.4) return 40;
  if (static_cast<double>(t) > 0.99) return 158;
  const float t200 = t * 200.0f;
  return static_cast<uint8_t>(static_cast<unsigned>(t200 - 40.0f));
}

void transmission_map(const uint8_t* mean, const uint8_t* min, uint8_t* codes, int width,
                      int height, float strength, float inv_light, GroupMinimum group_minimum) {
  if (width <= 0 || height <= 0) return;
  const int count = width * height;
  const int in_groups = count / 8 * 8;
  for (int i = 0; i < in_groups; ++i) {
    const bool high_lane = i % 8 >= 4;
    const int from = high_lane && group_minimum == GroupMinimum::kLowHalfTwice ? i - 4 : i;
    codes[i] = transmission_in_group(mean[i], min[from], strength, inv_light);
  }
  for (int i = in_groups; i < count; ++i)
    codes[i] = transmission_in_tail(mean[i], min[i], strength, inv_light);
}

void transmission_map_q8(const uint8_t* mean, const uint8_t* min, uint8_t* codes, int width,
                         int height, int strength_q8, int light) {
  if (width <= 0 || height <= 0) return;
  for (int i = 0; i < width * height; ++i)
    codes[i] = transmission_q8(mean[i], min[i], strength_q8, light);
}

StripeRows transmission_stripe(int height, int stripe) {
  const int rows = height / 8 / 2 * 2;
  return {stripe * rows, stripe < 7 ? rows : height - 7 * rows};
}

}  // namespace haze::reference
