// What holds for all recoveries of frames by maps of float transmissions.
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <string>
#include <thread>
#include <vector>

#include "tests/support/bytes_match.h"
#include "tests/support/float_recovery.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"
#include "tests/support/recovery_sweeps.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;

class FloatRecoveries : public ::testing::TestWithParam<FloatRecovery> {
 protected:
  void compare_noise(const Map& map, int width, int height) {
    compare(GetParam(), make_frame(random_, random_.one_of(kMoods), Colours::kWild, width, height),
            map, random_light(random_), width, height);
  }

  Random random_{test_seed()};
};

INSTANTIATE_TEST_SUITE_P(Members, FloatRecoveries,
                         ::testing::Values(kAnchors, kInteger, kSingle, kNv21),
                         [](const auto& member) { return std::string(member.param.name); });

TEST_P(FloatRecoveries, LastArgumentHasNoEffect) {
  Random random(test_seed());
  const Frame frame = make_frame(random, Mood::kNoise, Colours::kWild, 20, 14);
  const Map map = make_transmissions(random, TransmissionMood::kUsual, 20, 14);
  for (const int ignored : {0, 1, -1, 7, 255, INT_MAX, INT_MIN})
    compare(GetParam(), frame, map, {120, 180, 210}, 20, 14, ignored);
}

TEST_P(FloatRecoveries, SizesUpTo40InEveryMood) {
  for_sizes_up_to_40(
      random_, [&](const Map& map, int width, int height) { compare_noise(map, width, height); });
}

TEST_P(FloatRecoveries, WidthsUpTo200) {
  for_widths_up_to_200(
      random_, [&](const Map& map, int width, int height) { compare_noise(map, width, height); });
}

// Frames of one block and of one block row or column hold nothing but edges.
TEST_P(FloatRecoveries, SmallestFrames) {
  Random random(test_seed());
  const int sizes[][2] = {{2, 2}, {4, 2}, {2, 4}, {4, 4}, {2, 12}, {12, 2}};
  for (const auto& size : sizes)
    for (const TransmissionMood mood : kTransmissionMoods)
      for (int i = 0; i < 20; ++i)
        compare(GetParam(), make_frame(random, Mood::kNoise, Colours::kWild, size[0], size[1]),
                make_transmissions(random, mood, size[0], size[1]), random_light(random), size[0],
                size[1]);
}

TEST_P(FloatRecoveries, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {2, 720}, {1280, 2}};
  for (const auto& size : sizes)
    compare(GetParam(), make_hazy_frame(random, size[0], size[1]),
            make_transmissions(random, TransmissionMood::kUsual, size[0], size[1]),
            random_light(random), size[0], size[1]);
}

// Whole steps of a walk in groups of blocks, and a few more or less.
TEST_P(FloatRecoveries, WidthsAroundPowersOf2) {
  Random random(test_seed());
  for (const int power : {64, 128, 256, 512, 1024})
    for (const int width : {power - 2, power, power + 2, power + 4})
      compare(GetParam(), make_frame(random, Mood::kNoise, Colours::kWild, width, 6),
              make_transmissions(random, TransmissionMood::kUsual, width, 6), random_light(random),
              width, 6);
}

TEST_P(FloatRecoveries, EmptySizesWriteNothing) {
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

TEST_P(FloatRecoveries, TouchesNothingPastTheFrame) {
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

TEST(FloatRecoveryThreads, IndependentCalls) {
  Random random(test_seed());
  struct Job {
    FloatRecovery member;
    Frame frame;
    Map map;
    Light light;
  };
  std::vector<Job> jobs;
  for (const FloatRecovery& member : {kAnchors, kInteger, kSingle, kNv21})
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
