#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <cstdint>
#include <limits>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/recovery_variants.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
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

void compare(const Frame& frame, const Map& map, const Light& light, int width, int height,
             int recover_arg = 0) {
  Frame want = frame;
  reference::recover_nv21_float(want.data(), map.data(), light.data(), width, height);
  GuardedBuffer<uint8_t> actual(frame);
  GuardedBuffer<float> transmission(map);
  GuardedBuffer<uint8_t> light_bgr(Frame(light.begin(), light.end()));
  HazeRemoving3Preview_NV21_f(actual.data(), transmission.data(), light_bgr.data(), width, height,
                              recover_arg);
  ASSERT_TRUE(bytes_match(actual, want,
                          {{"width", width},
                           {"height", height},
                           {"first t", map[0]},
                           {"B", light[0]},
                           {"G", light[1]},
                           {"R", light[2]},
                           {"row", width}}));
  ASSERT_TRUE(planes_match(transmission, map));
  ASSERT_TRUE(bytes_match(light_bgr, light));
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

TEST(FloatMapRecovery, LastArgumentHasNoEffect) {
  Random random(test_seed());
  const Frame frame = make_frame(random, Mood::kNoise, Colours::kWild, 20, 14);
  const Map map = make_transmissions(random, TransmissionMood::kUsual, 20, 14);
  for (const int recover_arg : {0, 1, -1, 7, 255, INT_MAX, INT_MIN})
    compare(frame, map, {120, 180, 210}, 20, 14, recover_arg);
}

TEST(FloatMapRecovery, SizesUpTo40InEveryMood) {
  Random random(test_seed());
  for (int half = 1; half <= 20; ++half)
    for (const TransmissionMood mood : kTransmissionMoods) {
      const int other = 2 * random.between(1, 20);
      compare(make_frame(random, random.one_of(kMoods), Colours::kWild, 2 * half, other),
              make_transmissions(random, mood, 2 * half, other), random_light(random), 2 * half,
              other);
      compare(make_frame(random, random.one_of(kMoods), Colours::kWild, other, 2 * half),
              make_transmissions(random, mood, other, 2 * half), random_light(random), other,
              2 * half);
    }
}

// Every length of what is left over by steps of vectors.
TEST(FloatMapRecovery, WidthsUpTo200) {
  Random random(test_seed());
  for (int half = 1; half <= 100; ++half) {
    const int width = 2 * half;
    const int height = 2 * random.between(1, 3);
    const TransmissionMood mood = random.one_of(kTransmissionMoods);
    compare(make_frame(random, random.one_of(kMoods), Colours::kWild, width, height),
            make_transmissions(random, mood, width, height), random_light(random), width, height);
  }
}

TEST(FloatMapRecovery, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {2, 720}, {1280, 2}};
  for (const auto& size : sizes)
    compare(make_hazy_frame(random, size[0], size[1]),
            make_transmissions(random, TransmissionMood::kUsual, size[0], size[1]),
            random_light(random), size[0], size[1]);
}

TEST(FloatMapRecovery, EmptySizesWriteNothing) {
  Map map(256, 0.5f);
  Light light = grey_light(100);
  const int sizes[][2] = {{0, 0},   {0, 2},       {2, 0},       {-2, 2},  {2, -2}, {-2, -2},
                          {-8, -8}, {INT_MIN, 2}, {2, INT_MIN}, {-16, 4}, {4, -16}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> frame(1200, 60);
    HazeRemoving3Preview_NV21_f(frame.data() + 600, map.data() + 128, light.data(), size[0],
                                size[1], 0);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(FloatMapRecovery, TouchesNothingPastTheFrame) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 70; ++half_width) {
    const int width = 2 * half_width;
    const Frame content = make_frame(random, Mood::kNoise, Colours::kWild, width, 6);
    const Map map = make_transmissions(random, TransmissionMood::kUsual, width, 6);
    PageEndBuffer<uint8_t> frame(content);
    PageEndBuffer<float> transmission(map);
    PageEndBuffer<uint8_t> light(Frame{90, 180, 200});
    Frame want = content;
    reference::recover_nv21_float(want.data(), map.data(), light.data(), width, 6);
    HazeRemoving3Preview_NV21_f(frame.data(), transmission.data(), light.data(), width, 6, 0);
    EXPECT_TRUE(bytes_match(frame, want, {{"width", width}}));
  }
}

TEST(FloatMapRecoveryThreads, IndependentCalls) {
  Random random(test_seed());
  struct Job {
    Frame frame;
    Map map;
    Light light;
  };
  std::vector<Job> jobs;
  for (int i = 0; i < 4; ++i)
    jobs.push_back({make_frame(random, Mood::kNoise, Colours::kWild, 64, 64),
                    make_transmissions(random, TransmissionMood::kUsual, 64, 64),
                    random_light(random)});
  std::vector<Job> running = jobs;
  std::vector<std::thread> threads;
  for (Job& job : running)
    threads.emplace_back([&job] {
      HazeRemoving3Preview_NV21_f(job.frame.data(), job.map.data(), job.light.data(), 64, 64, 0);
    });
  for (std::thread& thread : threads) thread.join();
  for (size_t i = 0; i < jobs.size(); ++i) {
    reference::recover_nv21_float(jobs[i].frame.data(), jobs[i].map.data(), jobs[i].light.data(),
                                  64, 64);
    EXPECT_TRUE(bytes_match(running[i].frame, jobs[i].frame));
  }
}

}  // namespace
}  // namespace haze::test
