// The group kernels of the transmission map, each called by name.
#include "estimate/transmission_kernels.h"

#include <gtest/gtest.h>

#include <cfloat>
#include <cstdint>
#include <limits>
#include <vector>

#include "tests/reference/transmission.h"
#include "tests/support/bytes_match.h"

namespace haze::test {
namespace {

using estimate::HighLanes;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNotANumber = std::numeric_limits<float>::quiet_NaN();

// Every pair of a mean and a minimum; the last row's minima differ within a group of eight.
struct EveryPair {
  EveryPair() : mean(256 * 256), minimum(mean.size()) {
    for (size_t i = 0; i < mean.size(); ++i) {
      mean[i] = static_cast<uint8_t>(i / 256);
      minimum[i] = static_cast<uint8_t>(i % 256 * 37);
    }
  }

  std::vector<uint8_t> mean;
  std::vector<uint8_t> minimum;
};

struct Setting {
  float strength;
  float inv_a;
};

std::vector<Setting> settings() {
  std::vector<Setting> all;
  for (float strength : {0.0f, 0.1f, 1.0f, 5.98f, 7.0f, -2.0f, kInfinity, -kInfinity, kNotANumber})
    for (float inv_a : {1.0f / 255, 1.0f / 100, 1.0f, 0.0f, -0.01f, kInfinity, kNotANumber})
      all.push_back({strength, inv_a});
  return all;
}

template <HighLanes kHighLanes>
std::vector<uint8_t> reference_codes(const EveryPair& pairs, Setting setting) {
  std::vector<uint8_t> codes(pairs.mean.size());
  for (size_t i = 0; i < codes.size(); ++i) {
    const size_t source = kHighLanes == HighLanes::kLow && i % 8 >= 4 ? i - 4 : i;
    codes[i] = reference::transmission_in_group(pairs.mean[i], pairs.minimum[source],
                                                setting.strength, setting.inv_a);
  }
  return codes;
}

template <HighLanes kHighLanes>
void expect_portable_groups() {
  const EveryPair pairs;
  for (const Setting setting : settings()) {
    std::vector<uint8_t> codes(pairs.mean.size(), 0xA5);
    estimate::group_codes_portable<kHighLanes>(
        pairs.mean.data(), pairs.minimum.data(), codes.data(), 0, codes.size(),
        estimate::group_arguments(setting.strength, setting.inv_a));
    ASSERT_TRUE(bytes_match(codes, reference_codes<kHighLanes>(pairs, setting),
                            {{"strength", setting.strength}, {"invA", setting.inv_a}}));
  }
}

TEST(TransmissionKernels, PortableGroupsAreExactForEveryPair) {
  expect_portable_groups<HighLanes::kOwn>();
}

TEST(TransmissionKernels, PortableGroupsWithTheLaneDefectAreExactForEveryPair) {
  expect_portable_groups<HighLanes::kLow>();
}

TEST(TransmissionKernels, ArgumentsBelowTheNormalRangeCountAsZero) {
  const float tiny = FLT_MIN / 2;
  EXPECT_EQ(estimate::group_arguments(tiny, 1).strength, 0.0f);
  EXPECT_EQ(estimate::group_arguments(-tiny, 1).strength, 0.0f);
  EXPECT_EQ(estimate::group_arguments(1, tiny).minus_inv_a, 0.0f);
  EXPECT_EQ(estimate::group_arguments(FLT_MIN, FLT_MIN).strength, FLT_MIN);
  EXPECT_EQ(estimate::group_arguments(FLT_MIN, FLT_MIN).minus_inv_a, -FLT_MIN);
}

#if HAZE_NEON
template <HighLanes kHighLanes>
void expect_neon_groups() {
  const EveryPair pairs;
  for (const Setting setting : settings()) {
    std::vector<uint8_t> codes(pairs.mean.size(), 0xA5);
    ASSERT_EQ(estimate::group_codes_neon<kHighLanes>(
                  pairs.mean.data(), pairs.minimum.data(), codes.data(), codes.size(),
                  estimate::group_arguments(setting.strength, setting.inv_a)),
              codes.size());
    ASSERT_TRUE(bytes_match(codes, reference_codes<kHighLanes>(pairs, setting),
                            {{"strength", setting.strength}, {"invA", setting.inv_a}}));
  }
}

TEST(TransmissionKernels, NeonGroupsAreExactForEveryPair) { expect_neon_groups<HighLanes::kOwn>(); }

TEST(TransmissionKernels, NeonGroupsWithTheLaneDefectAreExactForEveryPair) {
  expect_neon_groups<HighLanes::kLow>();
}

TEST(TransmissionKernels, NeonStopsAtTheLastWholeStep) {
  const EveryPair pairs;
  for (size_t end = 0; end <= 64; end += 8) {
    std::vector<uint8_t> codes(80, 0xA5);
    const size_t done = estimate::group_codes_neon<HighLanes::kOwn>(
        pairs.mean.data(), pairs.minimum.data(), codes.data(), end,
        estimate::group_arguments(1.0f, 1.0f / 255));
    EXPECT_EQ(done, end / 16 * 16);
    EXPECT_EQ(codes[done], 0xA5);
  }
}
#endif

}  // namespace
}  // namespace haze::test
