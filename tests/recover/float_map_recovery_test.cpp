#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/float_recovery.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNotANumber = std::numeric_limits<float>::quiet_NaN();

void compare(const Frame& frame, const Map& map, const Light& light, int width, int height) {
  compare(kNv21, frame, map, light, width, height);
}

// Every byte value in luma and in both chroma channels, in rows of whole steps of any vector path.
constexpr int kWidth = 128;
constexpr int kHeight = 8;

Frame every_value() {
  Frame frame(kWidth * kHeight * 3 / 2);
  for (size_t i = 0; i < kWidth * kHeight; ++i) frame[i] = static_cast<uint8_t>(i);
  for (size_t i = 0; i < kWidth * kHeight / 4; ++i) {
    frame[kWidth * kHeight + 2 * i] = static_cast<uint8_t>(i);
    frame[kWidth * kHeight + 2 * i + 1] = static_cast<uint8_t>(255 - i);
  }
  return frame;
}

Map flat(float t) { return Map(kWidth * kHeight / 4, t); }

Frame recovered(float t, Light light) {
  Frame frame = every_value();
  Map map = flat(t);
  HazeRemoving3Preview_NV21_f(frame.data(), map.data(), light.data(), kWidth, kHeight, 0);
  return frame;
}

constexpr size_t kLumaBytes = kWidth * kHeight;

TEST(FloatMapRecovery, ClearTransmissionOnlyAppliesTheToneCurve) {
  Random random(test_seed());
  for (int i = 0; i < 8; ++i) {
    const Frame before = every_value();
    const Frame after = recovered(1.0f, random_light(random));
    for (size_t j = 0; j < kLumaBytes; ++j)
      ASSERT_EQ(after[j], reference::kToneCurve[before[j]]) << j;
    EXPECT_TRUE(bytes_match({after.data() + kLumaBytes, kLumaBytes / 2},
                            {before.data() + kLumaBytes, kLumaBytes / 2}));
  }
}

TEST(FloatMapRecovery, HalfTransmission) {
  const Frame after = recovered(0.5f, grey_light(100));
  EXPECT_EQ(after[150], 204);
  EXPECT_EQ(after[kLumaBytes + 2 * 100], 72);
  EXPECT_EQ(after[kLumaBytes + 2 * (255 - 100) + 1], 72);
  compare(every_value(), flat(0.5f), grey_light(100), kWidth, kHeight);
}

// 0 / 0 is not a number and gives 0; any other byte goes to the end of the range on its own side.
TEST(FloatMapRecovery, TransmissionOf0) {
  const Frame before = every_value();
  for (const float zero : {0.0f, -0.0f}) {
    const Frame after = recovered(zero, grey_light(100));
    const int above = std::signbit(zero) ? 0 : 255;
    for (size_t j = 0; j < kLumaBytes; ++j) {
      const int x = before[j] == 100 ? 0 : (before[j] > 100 ? above : 255 - above);
      ASSERT_EQ(after[j], reference::kToneCurve[x]) << j;
    }
    for (size_t j = kLumaBytes; j < after.size(); ++j) {
      const int x = before[j] == 128 ? 0 : (before[j] > 128 ? above : 255 - above);
      ASSERT_EQ(after[j], x) << j;
    }
  }
}

TEST(FloatMapRecovery, TransmissionIsTakenAsGiven) {
  Random random(test_seed());
  for (const float t : {-1.0f, -0.5f, -100.0f, 0.0f, -0.0f, 1.5f, 2.0f, 300.0f, 1.0e30f, 1.0e-30f,
                        -1.0e-30f, kInfinity, -kInfinity, kNotANumber})
    for (int i = 0; i < 4; ++i)
      compare(every_value(), flat(t), random_light(random), kWidth, kHeight);
  const Frame nothing = recovered(kNotANumber, grey_light(10));
  for (const uint8_t byte : nothing) ASSERT_EQ(byte, 0);
  // An infinite transmission leaves the light.
  const Frame light = recovered(kInfinity, grey_light(10));
  for (size_t j = 0; j < light.size(); ++j)
    ASSERT_EQ(light[j], j < kLumaBytes ? reference::kToneCurve[10] : 128);
}

TEST(FloatMapRecovery, HeightOf0LeavesTheFrame) {
  GuardedBuffer<uint8_t> frame(384, 60);
  Map map(64, 0.5f);
  Light light = grey_light(100);
  HazeRemoving3Preview_NV21_f(frame.data(), map.data(), light.data(), 16, 0, 0);
  EXPECT_TRUE(all_bytes_are(frame, 60));
}

TEST(FloatMapRecovery, EveryLightAndByteOfManyTransmissions) {
  Random random(test_seed());
  const Frame frame = every_value();
  for (int a = 0; a < 256; ++a)
    for (int i = 0; i < 3; ++i) {
      const float t = i == 0 ? static_cast<float>(random.between(1, 256)) / 256.0f
                             : float_between(random, 0.02f, 1.1f);
      compare(frame, flat(t), grey_light(a), kWidth, kHeight);
    }
}

// Quotients that come out at whole numbers, where one rounding more or less shows.
TEST(FloatMapRecovery, QuotientsAtWholeNumbers) {
  Random random(test_seed());
  const Frame frame = every_value();
  for (int i = 0; i < 200; ++i) {
    Map map;
    for (int j = 0; j < kWidth * kHeight / 4; ++j) {
      const float t =
          static_cast<float>(random.between(1, 127)) / static_cast<float>(random.between(20, 255));
      map.push_back(ulps_from(t, random.between(-1, 1)));
    }
    compare(frame, map, random_light(random), kWidth, kHeight);
  }
}

}  // namespace
}  // namespace haze::test
