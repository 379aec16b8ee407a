// Which reciprocal a pixel takes, and what it makes of its byte.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <limits>
#include <string>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/float_recovery.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;
using reference::kToneCurve;

class ReciprocalIndex : public ::testing::TestWithParam<FloatRecovery> {};

INSTANTIATE_TEST_SUITE_P(Members, ReciprocalIndex, ::testing::Values(kAnchors, kInteger, kSingle),
                         [](const auto& member) { return std::string(member.param.name); });

TEST(ReciprocalReference, Entries) {
  EXPECT_EQ(reference::reciprocal(0), 65536);
  EXPECT_EQ(reference::reciprocal(1), 65536);
  EXPECT_EQ(reference::reciprocal(2), 32768);
  EXPECT_EQ(reference::reciprocal(3), 21845);
  EXPECT_EQ(reference::reciprocal(255), 257);
}

// The lights have luma 0 and chroma 1, so that of any two indices some byte tells which was taken.
TEST_P(ReciprocalIndex, EveryIndexStepOfOneTransmission) {
  const Frame frame = AllValues::frame();
  for (int n = 1; n <= 256; ++n)
    for (int ulps = -3; ulps <= 3; ++ulps) {
      const float anchor_step = ulps_from(static_cast<float>(n) / 255.0f, ulps);
      const float neighbour_step = ulps_from(static_cast<float>(n) / 256.0f, ulps);
      compare(GetParam(), frame, AllValues::map(anchor_step), {0, 255, 255}, AllValues::kWidth,
              AllValues::kHeight);
      compare(GetParam(), frame, AllValues::map(neighbour_step), grey_light(0), AllValues::kWidth,
              AllValues::kHeight);
    }
}

// Sums of two and four neighbours at the steps of the index; the order of additions decides many of
// them.
TEST_P(ReciprocalIndex, IndexStepsOfNeighbourSums) {
  Random random(test_seed());
  for (int i = 0; i < 400; ++i) {
    const int width = 2 * random.between(1, i % 4 == 3 ? 100 : 8);
    const int height = 2 * random.between(1, i % 4 == 3 ? 3 : 8);
    const Light light = i % 2 == 0 ? grey_light(0) : random_light(random);
    compare(GetParam(), make_frame(random, Mood::kNoise, Colours::kWild, width, height),
            make_transmissions(random, TransmissionMood::kSumSteps, width, height), light, width,
            height);
  }
}

TEST_P(ReciprocalIndex, IndicesBeyondTheTableAreItsEnds) {
  Random random(test_seed());
  const Frame frame = AllValues::frame();
  const Light light = {70, 120, 130};
  const Frame first =
      run(GetParam(), frame, AllValues::map(0.001f), light, AllValues::kWidth, AllValues::kHeight);
  for (const float t :
       {0.0f, -0.0f, -0.5f, -1.0f, -1.0e30f, -std::numeric_limits<float>::infinity(),
        std::numeric_limits<float>::quiet_NaN()}) {
    compare(GetParam(), frame, AllValues::map(t), light, AllValues::kWidth, AllValues::kHeight);
    EXPECT_TRUE(bytes_match(
        run(GetParam(), frame, AllValues::map(t), light, AllValues::kWidth, AllValues::kHeight),
        first))
        << t;
  }
  const Frame last =
      run(GetParam(), frame, AllValues::map(1.0f), light, AllValues::kWidth, AllValues::kHeight);
  for (const float t :
       {1.001f, 1.1f, 2.0f, 1.0e7f, 1.0e9f, 1.0e30f, std::numeric_limits<float>::infinity()}) {
    compare(GetParam(), frame, AllValues::map(t), light, AllValues::kWidth, AllValues::kHeight);
    EXPECT_TRUE(bytes_match(
        run(GetParam(), frame, AllValues::map(t), light, AllValues::kWidth, AllValues::kHeight),
        last))
        << t;
  }
}

// Some light with the given luma.
Light light_of_luma(int luma) {
  for (int green = luma; green < 256; ++green) {
    const Light light = {static_cast<uint8_t>(luma), static_cast<uint8_t>(green),
                         static_cast<uint8_t>(luma)};
    if (reference::light_to_yuv(light.data()).y == luma) return light;
  }
  ADD_FAILURE() << "no light has luma " << luma;
  return grey_light(luma);
}

// With t = (n + 1) / 256 all pixels of a block have index n. Each row holds every luma byte and
// some more, so that all 256 indices, lights and bytes meet in steps of any vector path, in both
// rows of a block. In four parts, so that they may run side by side.
class EveryIndexLightAndByte : public ::testing::TestWithParam<int> {};

INSTANTIATE_TEST_SUITE_P(Quarters, EveryIndexLightAndByte, ::testing::Values(0, 1, 2, 3));

TEST_P(EveryIndexLightAndByte, OfLuma) {
  constexpr int kWidth = 264;
  constexpr size_t kLumaBytes = 2 * kWidth;
  uint8_t frame[3 * kWidth] = {};
  uint8_t want[kLumaBytes];
  float map[kWidth / 2];
  for (int luma = GetParam(); luma < 256; luma += 4) {
    Light light = light_of_luma(luma);
    for (int n = 0; n < 256; ++n) {
      std::fill(map, map + kWidth / 2, (static_cast<float>(n) + 1.0f) / 256.0f);
      for (int x = 0; x < kWidth; ++x) {
        const int value = x % 256;
        const uint8_t wanted = kToneCurve[reference::recover_integer(value, luma, n)];
        frame[x] = static_cast<uint8_t>(value);
        want[x] = wanted;
        // The lower row takes each byte in a column of the other parity.
        frame[kWidth + (x + 1) % kWidth] = static_cast<uint8_t>(value);
        want[kWidth + (x + 1) % kWidth] = wanted;
      }
      HazeRemoving1Preview(frame, map, light.data(), kWidth, 2, 0);
      ASSERT_TRUE(bytes_match({frame, kLumaBytes}, {want, kLumaBytes},
                              {{"luma", luma}, {"index", n}, {"row", kWidth}}));
    }
  }
}

// Luma at all strengths, and chroma close to the light's at the strongest, where the light's
// fraction is amplified most: together they tell the last bits of every number on the way.
TEST(SingleRecovery, LastBitsOfManyLights) {
  constexpr int kWidth = 98;
  constexpr int kHeight = 12;
  constexpr int kBlocks = kWidth / 2 * (kHeight / 2);
  Random random(test_seed());
  for (int i = 0; i < 1500; ++i) {
    const Light light = {random.byte(), random.byte(), random.byte()};
    const reference::LightYuv yuv = reference::light_to_yuv(light.data());
    Frame frame = make_image(random, Mood::kNoise, kWidth, kHeight);
    Map map;
    for (const int around : {yuv.u, yuv.v})
      for (int j = 0; j < kBlocks; ++j) {
        const int value = std::min(std::max(around + random.between(-8, 8), 0), 255);
        frame.push_back(static_cast<uint8_t>(value));
      }
    const int strongest = i % 2 == 0 ? 24 : 255;
    for (int j = 0; j < kBlocks; ++j)
      map.push_back((static_cast<float>(random.between(1, strongest)) + 0.5f) / 255.0f);
    compare(kSingle, frame, map, light, kWidth, kHeight);
  }
}

// Bytes that would be whole numbers exactly, had the light's luma not been rounded: there each
// rounding on the way shows.
TEST(SingleRecovery, RealNumbersThatAreWhole) {
  Random random(test_seed());
  int found = 0;
  for (int i = 0; i < 150; ++i) {
    const Light light = random_light(random);
    const int luma_1000 = light[1] * 587 + light[0] * 114 + light[2] * 299;
    for (int index = 2; index < 256; ++index) {
      const int k = reference::reciprocal(index);
      // 256000 J = luma_1000 * (256 - k) + 1000 * Y * k
      Frame frame;
      for (int value = 0; value < 256; ++value) {
        const int64_t sum = int64_t{luma_1000} * (256 - k) + int64_t{1000} * value * k;
        if (sum % 256000 == 0 && sum >= 0 && sum <= 255 * 256000)
          frame.push_back(static_cast<uint8_t>(value));
      }
      if (frame.empty()) continue;
      ++found;
      frame.resize(68 * 3, frame[0]);
      const float t = (static_cast<float>(index) + 1.0f) / 256.0f;
      compare(kSingle, frame, Map(34, t), light, 68, 2);
    }
  }
  EXPECT_GT(found, 100);
}

}  // namespace
}  // namespace haze::test
