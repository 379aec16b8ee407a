#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"
#include "tests/support/recovery_sweeps.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;

constexpr uint8_t kUnwritten = 0xA5;

Frame make_packed(Random& random, Mood mood, int width, int height) {
  return make_image(random, mood, 2 * width, height);
}

Frame expected(const Frame& src, const Map& map, const Light& light, int width, int height) {
  Frame want(src.size());
  reference::recover_packed(src.data(), map.data(), light.data(), want.data(), width, height);
  return want;
}

void compare(const Frame& src, const Map& map, const Light& light, int width, int height) {
  GuardedBuffer<uint8_t> source(src);
  GuardedBuffer<float> transmission(map);
  GuardedBuffer<uint8_t> light_bgr(Frame(light.begin(), light.end()));
  GuardedBuffer<uint8_t> dst(src.size(), kUnwritten);
  HazeRemovingPreview(source.data(), transmission.data(), light_bgr.data(), dst.data(), width,
                      height);
  ASSERT_TRUE(bytes_match(dst, expected(src, map, light, width, height),
                          {{"width", width},
                           {"height", height},
                           {"first t", map[0]},
                           {"B", light[0]},
                           {"G", light[1]},
                           {"R", light[2]},
                           {"row", 2 * width}}));
  ASSERT_TRUE(bytes_match(source, src));
  ASSERT_TRUE(planes_match(transmission, map));
  ASSERT_TRUE(bytes_match(light_bgr, light));
}

Frame run(Frame src, Map map, Light light, int width, int height) {
  Frame dst(src.size(), kUnwritten);
  HazeRemovingPreview(src.data(), map.data(), light.data(), dst.data(), width, height);
  return dst;
}

// Index 127 doubles contrast: reciprocal 516 of 256. The light's U is 128 and its V 128.
TEST(PackedRecovery, OneBlock) {
  const Frame src = {100, 140, 60,  100,  // Y0 Cr Y1 Cb
                     20,  1,   255, 2};
  const Frame dst = run(src, Map(1, 0.5f), grey_light(0), 2, 2);
  const auto luma = [](int j) { return LutTablePreview[j]; };
  EXPECT_EQ(dst[0], luma(516 * 100 >> 8));
  EXPECT_EQ(dst[2], luma(516 * 60 >> 8));
  EXPECT_EQ(dst[4], luma(516 * 20 >> 8));
  EXPECT_EQ(dst[6], luma(255));
  EXPECT_EQ(dst[1], 128 + (516 * 12 >> 8));
  EXPECT_EQ(dst[3], 128 - 57);
  EXPECT_EQ(dst[5], dst[1]);
  EXPECT_EQ(dst[7], dst[3]);
}

TEST(PackedRecovery, ChromaOfOddRowsIsNotRead) {
  Random random(test_seed());
  for (int i = 0; i < 10; ++i) {
    const int width = 2 * random.between(1, 12);
    const int height = 2 * random.between(1, 12);
    Frame src = make_packed(random, Mood::kNoise, width, height);
    const Map map = make_transmissions(random, TransmissionMood::kUsual, width, height);
    const Light light = random_light(random);
    const Frame before = run(src, map, light, width, height);
    for (int y = 1; y < height; y += 2)
      for (int x = 0; x < width; ++x) src[static_cast<size_t>(2 * (y * width + x) + 1)] ^= 0xFF;
    EXPECT_TRUE(bytes_match(run(src, map, light, width, height), before));
    // Of even rows it is.
    for (int x = 0; x < width; ++x) src[static_cast<size_t>(2 * x + 1)] ^= 0xFF;
    EXPECT_FALSE(bytes_match(run(src, map, light, width, height), before));
  }
}

TEST(PackedRecovery, SizesUpTo40InEveryMood) {
  Random random(test_seed());
  for_sizes_up_to_40(random, [&](const Map& map, int width, int height) {
    compare(make_packed(random, random.one_of(kMoods), width, height), map, random_light(random),
            width, height);
  });
}

TEST(PackedRecovery, WidthsUpTo200) {
  Random random(test_seed());
  for_widths_up_to_200(random, [&](const Map& map, int width, int height) {
    compare(make_packed(random, random.one_of(kMoods), width, height), map, random_light(random),
            width, height);
  });
}

TEST(PackedRecovery, SmallestFrames) {
  Random random(test_seed());
  const int sizes[][2] = {{2, 2}, {4, 2}, {2, 4}, {4, 4}, {2, 12}, {12, 2}};
  for (const auto& size : sizes)
    for (const TransmissionMood mood : kTransmissionMoods)
      for (int i = 0; i < 20; ++i)
        compare(make_packed(random, Mood::kNoise, size[0], size[1]),
                make_transmissions(random, mood, size[0], size[1]), random_light(random), size[0],
                size[1]);
}

TEST(PackedRecovery, IndexSteps) {
  Random random(test_seed());
  for (int n = 1; n <= 256; ++n)
    for (int ulps = -2; ulps <= 2; ++ulps)
      for (const float divisor : {255.0f, 256.0f}) {
        const float t = ulps_from(static_cast<float>(n) / divisor, ulps);
        compare(make_packed(random, Mood::kNoise, 68, 4), Map(68, t), {0, 255, 255}, 68, 4);
      }
  for (int i = 0; i < 300; ++i) {
    const int width = 2 * random.between(1, i % 4 == 3 ? 60 : 8);
    const int height = 2 * random.between(1, i % 4 == 3 ? 3 : 8);
    compare(make_packed(random, Mood::kNoise, width, height),
            make_transmissions(random, TransmissionMood::kSumSteps, width, height), grey_light(0),
            width, height);
  }
}

TEST(PackedRecovery, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {2, 720}, {1280, 2}};
  for (const auto& size : sizes)
    compare(make_packed(random, Mood::kGradient, size[0], size[1]),
            make_transmissions(random, TransmissionMood::kUsual, size[0], size[1]),
            random_light(random), size[0], size[1]);
}

// Whole steps of a walk in groups of blocks, and a few more or less.
TEST(PackedRecovery, WidthsAroundPowersOf2) {
  Random random(test_seed());
  for (const int power : {64, 128, 256, 512, 1024})
    for (const int width : {power - 2, power, power + 2, power + 4})
      compare(make_packed(random, Mood::kNoise, width, 6),
              make_transmissions(random, TransmissionMood::kUsual, width, 6), random_light(random),
              width, 6);
}

TEST(PackedRecovery, CallsDoNotRememberTheLast) {
  Random random(test_seed());
  const Frame src = make_packed(random, Mood::kNoise, 24, 18);
  const Map map = make_transmissions(random, TransmissionMood::kUsual, 24, 18);
  for (const int a : {200, 201, 200, 23, 22, 0, 255}) compare(src, map, grey_light(a), 24, 18);
}

TEST(PackedRecovery, EmptySizesWriteNothing) {
  Map map(256, 0.5f);
  Frame src(1200, 90);
  Light light = grey_light(100);
  const int sizes[][2] = {{0, 0},   {0, 2},       {2, 0},       {-2, 2},  {2, -2}, {-2, -2},
                          {-8, -8}, {INT_MIN, 2}, {2, INT_MIN}, {-16, 4}, {4, -16}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> dst(1200, 60);
    HazeRemovingPreview(src.data() + 600, map.data() + 128, light.data(), dst.data() + 600, size[0],
                        size[1]);
    EXPECT_TRUE(all_bytes_are(dst, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(PackedRecovery, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 70; ++half_width) {
    const int width = 2 * half_width;
    const Frame content = make_packed(random, Mood::kNoise, width, 6);
    const Map map = make_transmissions(random, TransmissionMood::kUsual, width, 6);
    const Light light = {90, 180, 200};
    PageEndBuffer<uint8_t> src(content);
    PageEndBuffer<float> transmission(map);
    PageEndBuffer<uint8_t> light_bgr(Frame(light.begin(), light.end()));
    PageEndBuffer<uint8_t> dst(content.size());
    HazeRemovingPreview(src.data(), transmission.data(), light_bgr.data(), dst.data(), width, 6);
    EXPECT_TRUE(bytes_match(dst, expected(content, map, light, width, 6), {{"width", width}}));
  }
}

}  // namespace
}  // namespace haze::test
