#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/planar_recovery.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;
using reference::kToneCurve;

class FullPrecisionRecovery : public ::testing::TestWithParam<PlanarMember> {};

INSTANTIATE_TEST_SUITE_P(Members, FullPrecisionRecovery,
                         ::testing::Values(kAnchors, kInteger, kSingle),
                         [](const auto& member) { return std::string(member.param.name); });

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
        for (const PlanarMember& member : {kAnchors, kInteger, kSingle})
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

TEST_P(FullPrecisionRecovery, LastArgumentHasNoEffect) {
  Random random(test_seed());
  const Frame frame = make_frame(random, Mood::kNoise, Colours::kWild, 20, 14);
  const Map map = make_transmissions(random, TransmissionMood::kUsual, 20, 14);
  for (const int ignored : {0, 1, -1, 7, 255, INT_MAX, INT_MIN})
    compare(GetParam(), frame, map, {120, 180, 210}, 20, 14, ignored);
}

TEST_P(FullPrecisionRecovery, SizesUpTo40InEveryMood) {
  Random random(test_seed());
  for (int half = 1; half <= 20; ++half)
    for (const TransmissionMood mood : kTransmissionMoods) {
      const int other = 2 * random.between(1, 20);
      compare(
          GetParam(), make_frame(random, random.one_of(kMoods), Colours::kWild, 2 * half, other),
          make_transmissions(random, mood, 2 * half, other), random_light(random), 2 * half, other);
      compare(
          GetParam(), make_frame(random, random.one_of(kMoods), Colours::kWild, other, 2 * half),
          make_transmissions(random, mood, other, 2 * half), random_light(random), other, 2 * half);
    }
}

// Every length of what is left over by steps of vectors.
TEST_P(FullPrecisionRecovery, WidthsUpTo200) {
  Random random(test_seed());
  for (int half = 1; half <= 100; ++half) {
    const int width = 2 * half;
    const int height = 2 * random.between(1, 3);
    const TransmissionMood mood = random.one_of(kTransmissionMoods);
    compare(GetParam(), make_frame(random, random.one_of(kMoods), Colours::kWild, width, height),
            make_transmissions(random, mood, width, height), random_light(random), width, height);
  }
}

// Frames of one block and of one block row or column hold nothing but edges.
TEST_P(FullPrecisionRecovery, SmallestFrames) {
  Random random(test_seed());
  const int sizes[][2] = {{2, 2}, {4, 2}, {2, 4}, {4, 4}, {2, 12}, {12, 2}};
  for (const auto& size : sizes)
    for (const TransmissionMood mood : kTransmissionMoods)
      for (int i = 0; i < 20; ++i)
        compare(GetParam(), make_frame(random, Mood::kNoise, Colours::kWild, size[0], size[1]),
                make_transmissions(random, mood, size[0], size[1]), random_light(random), size[0],
                size[1]);
}

TEST_P(FullPrecisionRecovery, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {2, 720}, {1280, 2}};
  for (const auto& size : sizes)
    compare(GetParam(), make_hazy_frame(random, size[0], size[1]),
            make_transmissions(random, TransmissionMood::kUsual, size[0], size[1]),
            random_light(random), size[0], size[1]);
}

// Whole steps of a walk in groups of blocks, and a few more or less.
TEST_P(FullPrecisionRecovery, WidthsAroundPowersOf2) {
  Random random(test_seed());
  for (const int power : {64, 128, 256, 512, 1024})
    for (const int width : {power - 2, power, power + 2, power + 4})
      compare(GetParam(), make_frame(random, Mood::kNoise, Colours::kWild, width, 6),
              make_transmissions(random, TransmissionMood::kUsual, width, 6), random_light(random),
              width, 6);
}

TEST_P(FullPrecisionRecovery, EmptySizesWriteNothing) {
  Map map(256, 0.5f);
  Light light = grey_light(100);
  const int sizes[][2] = {{0, 0},   {0, 2},       {2, 0},       {-2, 2},  {2, -2}, {-2, -2},
                          {-8, -8}, {INT_MIN, 2}, {2, INT_MIN}, {-16, 4}, {4, -16}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> frame(1200, 60);
    GetParam().recover(frame.data() + 600, map.data() + 128, light.data(), size[0], size[1], 0);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST_P(FullPrecisionRecovery, TouchesNothingPastTheFrame) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 70; ++half_width) {
    const int width = 2 * half_width;
    const Frame content = make_frame(random, Mood::kNoise, Colours::kWild, width, 6);
    const Map map = make_transmissions(random, TransmissionMood::kUsual, width, 6);
    PageEndBuffer<uint8_t> frame(content);
    PageEndBuffer<float> transmission(map);
    PageEndBuffer<uint8_t> light(Frame{90, 180, 200});
    Frame want = content;
    GetParam().reference(want.data(), map.data(), light.data(), width, 6);
    GetParam().recover(frame.data(), transmission.data(), light.data(), width, 6, 0);
    EXPECT_TRUE(bytes_match(frame, want, {{"width", width}}));
  }
}

TEST(FullPrecisionRecoveryThreads, IndependentCalls) {
  Random random(test_seed());
  struct Job {
    PlanarMember member;
    Frame frame;
    Map map;
    Light light;
  };
  std::vector<Job> jobs;
  for (const PlanarMember& member : {kAnchors, kInteger, kSingle, kInteger})
    jobs.push_back({member, make_frame(random, Mood::kNoise, Colours::kWild, 64, 64),
                    make_transmissions(random, TransmissionMood::kUsual, 64, 64),
                    random_light(random)});
  std::vector<Job> running = jobs;
  std::vector<std::thread> threads;
  for (Job& job : running)
    threads.emplace_back([&job] {
      job.member.recover(job.frame.data(), job.map.data(), job.light.data(), 64, 64, 0);
    });
  for (std::thread& thread : threads) thread.join();
  for (size_t i = 0; i < jobs.size(); ++i) {
    Job& job = jobs[i];
    job.member.reference(job.frame.data(), job.map.data(), job.light.data(), 64, 64);
    EXPECT_TRUE(bytes_match(running[i].frame, job.frame)) << job.member.name;
  }
}

}  // namespace
}  // namespace haze::test
