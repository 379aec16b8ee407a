#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_recovery.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;
using reference::kToneCurve;

// The shift rounds down, so a byte below the light's falls by one even where nothing is to recover.
TEST(IntegerRecovery, ClearTransmission) {
  for (const Light& light : {grey_light(120), Light{40, 200, 90}, grey_light(0), grey_light(255)}) {
    const reference::LightYuv yuv = reference::light_to_yuv(light.data());
    const Frame before = AllValues::frame();
    const Frame after =
        run(kInteger, before, AllValues::map(1.0f), light, AllValues::kWidth, AllValues::kHeight);
    const auto shifted = [](int value, int around) {
      return value >= around ? value : std::max(value - 1, 0);
    };
    for (size_t i = 0; i < AllValues::kLumaBytes; ++i)
      ASSERT_EQ(after[i], kToneCurve[shifted(before[i], yuv.y)]) << i;
    for (size_t i = AllValues::kLumaBytes; i < after.size(); ++i)
      ASSERT_EQ(
          after[i],
          shifted(before[i], i < AllValues::kLumaBytes + AllValues::kChromaBytes ? yuv.u : yuv.v))
          << i;
  }
}

TEST(IntegerRecovery, BlackLight) {
  const Frame before = AllValues::frame();
  for (int n = 0; n < 256; ++n) {
    const float t = (static_cast<float>(n) + 1.0f) / 256.0f;
    const Frame after = run(kInteger, before, AllValues::map(t), grey_light(0), AllValues::kWidth,
                            AllValues::kHeight);
    for (size_t i = 0; i < AllValues::kLumaBytes; ++i) {
      const int j = std::min(255, (reference::reciprocal(n) * before[i]) >> 8);
      ASSERT_EQ(after[i], kToneCurve[j]) << "index " << n << ", byte " << i;
    }
    // Chroma is neutral at 128.
    const size_t neutral = AllValues::kLumaBytes + 128;
    ASSERT_EQ(after[neutral], 128);
  }
}

// Blue alone takes the light's U to 255, its opposite takes it to 1; at the light's own chroma
// nothing changes.
TEST(IntegerRecovery, ExtremeChromaOfTheLight) {
  EXPECT_EQ(reference::light_to_yuv(Light{255, 0, 0}.data()).u, 255);
  EXPECT_EQ(reference::light_to_yuv(Light{0, 255, 255}.data()).u, 1);
  const Frame blue = run(kInteger, AllValues::frame(), AllValues::map(1.0f), {255, 0, 0},
                         AllValues::kWidth, AllValues::kHeight);
  EXPECT_EQ(blue[AllValues::kLumaBytes + 255], 255);
  EXPECT_EQ(blue[AllValues::kLumaBytes + 254], 253);
  const Frame yellow = run(kInteger, AllValues::frame(), AllValues::map(1.0f), {0, 255, 255},
                           AllValues::kWidth, AllValues::kHeight);
  EXPECT_EQ(yellow[AllValues::kLumaBytes + 1], 1);
  EXPECT_EQ(yellow[AllValues::kLumaBytes], 0);
  for (const int b : {0, 255})
    for (const int g : {0, 255})
      for (const int r : {0, 255}) {
        const Light light = {static_cast<uint8_t>(b), static_cast<uint8_t>(g),
                             static_cast<uint8_t>(r)};
        const reference::LightYuv yuv = reference::light_to_yuv(light.data());
        EXPECT_GE(std::min(yuv.u, yuv.v), 1);
        EXPECT_LE(std::max(yuv.u, yuv.v), 255);
        for (const FloatRecovery& member : {kAnchors, kInteger, kSingle})
          compare(member, AllValues::frame(), AllValues::map(0.6f), light, AllValues::kWidth,
                  AllValues::kHeight);
      }
}

// Of two blocks with the top-left values 10 and 7, all at t = 1 and without light: 11 and 7 through
// the tone curve.
TEST(AnchorRecovery, FillsWithAveragesOfRecoveredPixels) {
  Frame frame(24, 200);
  frame[0] = 10;
  frame[2] = 7;
  frame[8] = 20;
  frame[10] = 255;
  const Frame after = run(kAnchors, frame, Map(4, 1.0f), grey_light(0), 4, 4);
  ASSERT_EQ(kToneCurve[10], 11);
  ASSERT_EQ(kToneCurve[7], 7);
  ASSERT_EQ(kToneCurve[20], 25);
  ASSERT_EQ(kToneCurve[255], 250);
  EXPECT_EQ(after[0], 11);
  EXPECT_EQ(after[1], (11 + 7) / 2);
  EXPECT_EQ(after[4], (11 + 25) / 2);
  EXPECT_EQ(after[5], (11 + 7 + 25 + 250) / 4);
  // In the last column and row the top-left pixels have gone through the tone curve twice, the
  // others once.
  EXPECT_EQ(after[2], kToneCurve[kToneCurve[7]]);
  EXPECT_EQ(after[8], kToneCurve[kToneCurve[20]]);
  EXPECT_EQ(after[10], kToneCurve[kToneCurve[255]]);
  for (const size_t i : {3u, 6u, 7u, 9u, 11u, 12u, 13u, 14u, 15u})
    EXPECT_EQ(after[i], kToneCurve[200]) << i;
}

TEST(SingleRecovery, IntegersAndFloatsStayWithinOneAtFullTransmission) {
  Random random(test_seed());
  int differing = 0;
  for (int i = 0; i < 40; ++i) {
    const Light light = random_light(random);
    const Frame integer = run(kInteger, AllValues::frame(), AllValues::map(1.0f), light,
                              AllValues::kWidth, AllValues::kHeight);
    const Frame single = run(kSingle, AllValues::frame(), AllValues::map(1.0f), light,
                             AllValues::kWidth, AllValues::kHeight);
    for (size_t j = AllValues::kLumaBytes; j < integer.size(); ++j) {
      ASSERT_LE(std::abs(integer[j] - single[j]), 1);
      differing += integer[j] != single[j];
    }
  }
  EXPECT_GT(differing, 0);
}

}  // namespace
}  // namespace haze::test
