#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/float_transmission.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Plane = std::vector<float>;
using Image = std::vector<uint8_t>;
using Colour = std::array<uint8_t, 3>;

constexpr uint8_t kUnwritten = 0xA5;

struct Estimate {
  Plane filtered;
  Plane raw;
};

Estimate estimate(Image image, Colour light, int width, int height, int level) {
  Estimate result = {Plane(image.size() / 3), Plane(image.size() / 3)};
  EstimateTPreview(image.data(), light.data(), result.filtered.data(), result.raw.data(), width,
                   height, level);
  return result;
}

void compare(const Image& image, const Colour& light, int width, int height, int level) {
  const Plane raw = reference::raw_transmission(image.data(), light.data(), width, height, level);
  GuardedBuffer<uint8_t> src(image);
  GuardedBuffer<uint8_t> light_bytes(Image(light.begin(), light.end()));
  GuardedBuffer<float> actual_raw(raw.size(), kUnwritten);
  GuardedBuffer<float> actual(raw.size(), kUnwritten);
  EstimateTPreview(src.data(), light_bytes.data(), actual.data(), actual_raw.data(), width, height,
                   level);
  const std::initializer_list<Argument> arguments = {
      {"width", width},       {"height", height},     {"level", level}, {"light[0]", light[0]},
      {"light[1]", light[1]}, {"light[2]", light[2]}, {"row", width}};
  ASSERT_TRUE(planes_match(actual_raw, raw, arguments)) << "before the maximum filter";
  ASSERT_TRUE(
      planes_match(actual, reference::filtered_transmission(raw, width, height), arguments));
  ASSERT_TRUE(bytes_match(src, image));
  ASSERT_TRUE(bytes_match(light_bytes, light));
}

Image make_colours(Random& random, Mood mood, int width, int height) {
  return make_image(random, mood, 3 * width, height);
}

Colour make_light(Random& random) {
  return {static_cast<uint8_t>(random.between(1, 255)),
          static_cast<uint8_t>(random.between(1, 255)),
          static_cast<uint8_t>(random.between(1, 255))};
}

constexpr int kSide = 16;

Image grey_image(uint8_t value) { return Image(3 * kSide * kSide, value); }

Plane plain(float value) { return Plane(kSide * kSide, value); }

TEST(FloatTransmission, LevelsOutside0To9TakeStrength03) {
  Random random(test_seed());
  const Image image = make_colours(random, Mood::kNoise, kSide, kSide);
  const Colour light = {200, 190, 180};
  const Estimate want = estimate(image, light, kSide, kSide, 3);
  for (const int level : {10, -1, 99, 11, -10, 255, 256, INT_MAX, INT_MIN}) {
    const Estimate other = estimate(image, light, kSide, kSide, level);
    EXPECT_TRUE(planes_match(other.raw, want.raw, {{"level", level}}));
    EXPECT_TRUE(planes_match(other.filtered, want.filtered, {{"level", level}}));
    compare(image, light, kSide, kSide, level);
  }
}

TEST(FloatTransmission, Level0IsClear) {
  Random random(test_seed());
  const Estimate clear =
      estimate(make_colours(random, Mood::kNoise, kSide, kSide), {200, 1, 255}, kSide, kSide, 0);
  EXPECT_TRUE(planes_match(clear.raw, plain(1.0f)));
  EXPECT_TRUE(planes_match(clear.filtered, plain(1.0f)));
}

TEST(FloatTransmission, LargestOfTheChannels) {
  const Colour light = {200, 100, 50};
  const Estimate all = estimate(grey_image(100), light, kSide, kSide, 5);
  EXPECT_TRUE(planes_match(all.raw, plain(0.75f)));
  EXPECT_TRUE(planes_match(all.filtered, plain(0.75f)));
  EXPECT_EQ(reference::channel_transmission(100, 200, 0.5f), 0.75f);
  EXPECT_EQ(reference::channel_transmission(100, 100, 0.5f), 0.5f);
  EXPECT_EQ(reference::channel_transmission(100, 50, 0.5f), 0.4f);
  // With the first channel bright, the second one is the largest; with both bright, the lower bound
  // stays.
  Image image = grey_image(100);
  for (size_t i = 0; i < image.size(); i += 3) image[i] = 255;
  EXPECT_TRUE(planes_match(estimate(image, light, kSide, kSide, 5).raw, plain(0.5f)));
  for (size_t i = 1; i < image.size(); i += 3) image[i] = 255;
  EXPECT_TRUE(planes_match(estimate(image, light, kSide, kSide, 5).raw, plain(0.4f)));
}

TEST(FloatTransmission, PixelsOfTheLightsColour) {
  for (int level = 0; level <= 9; ++level)
    for (const int value : {1, 2, 64, 128, 200, 255}) {
      const uint8_t light = static_cast<uint8_t>(value);
      const Estimate result =
          estimate(grey_image(light), {light, light, light}, kSide, kSide, level);
      const float left = 1.0f - reference::haze_strength(level);
      EXPECT_NEAR(result.raw[0], left < 0.4f ? 0.4f : left, 1.0e-6f) << level;
      if (level >= 7) {
        EXPECT_EQ(result.raw[0], 0.4f);
      }
    }
}

TEST(FloatTransmission, SingleClearPixelBecomesASquare) {
  constexpr int kWidth = 40;
  constexpr int kHeight = 33;
  const int places[][2] = {{20, 16}, {0, 0}, {39, 32}, {3, 30}, {39, 0}, {7, 7}, {32, 25}};
  for (const auto& place : places) {
    Image image(3 * kWidth * kHeight, 255);
    const int x0 = place[0];
    const int y0 = place[1];
    for (int channel = 0; channel < 3; ++channel)
      image[static_cast<size_t>(3 * (y0 * kWidth + x0) + channel)] = 0;
    const Estimate result = estimate(image, {100, 100, 100}, kWidth, kHeight, 9);
    Plane want(kWidth * kHeight, 0.4f);
    for (int y = y0 - 7; y <= y0 + 7; ++y)
      for (int x = x0 - 7; x <= x0 + 7; ++x)
        if (x >= 0 && x < kWidth && y >= 0 && y < kHeight)
          want[static_cast<size_t>(y * kWidth + x)] = 1.0f;
    EXPECT_TRUE(planes_match(result.filtered, want, {{"x", x0}, {"y", y0}, {"row", kWidth}}));
  }
}

// One pixel per byte value in one channel; the two others are at the lower bound.
TEST(FloatTransmission, EveryLightValueAndLevelOfEachChannel) {
  for (int channel = 0; channel < 3; ++channel) {
    Image image = grey_image(255);
    for (size_t i = 0; i < 256; ++i)
      image[3 * i + static_cast<size_t>(channel)] = static_cast<uint8_t>(i);
    for (int level = 1; level <= 9; ++level)
      for (int value = 1; value <= 255; ++value) {
        Colour light = {1, 1, 1};
        light[static_cast<size_t>(channel)] = static_cast<uint8_t>(value);
        const Estimate result = estimate(image, light, kSide, kSide, level);
        Plane want(256);
        for (size_t i = 0; i < 256; ++i)
          want[i] =
              reference::channel_transmission(static_cast<uint8_t>(i), static_cast<uint8_t>(value),
                                              reference::haze_strength(level));
        ASSERT_TRUE(planes_match(result.raw, want,
                                 {{"channel", channel}, {"level", level}, {"light", value}}));
      }
  }
}

TEST(FloatTransmission, SizesUpTo40) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width) {
    const int height = random.between(1, 40);
    const Mood mood = random.one_of(kMoods);
    compare(make_colours(random, mood, width, height), make_light(random), width, height,
            random.between(0, 9));
    compare(make_colours(random, mood, height, width), make_light(random), height, width,
            random.between(0, 9));
  }
}

TEST(FloatTransmission, SmallestSizesAndBelow) {
  Random random(test_seed());
  for (int width = 13; width <= 17; ++width)
    for (int height = 13; height <= 17; ++height)
      compare(make_colours(random, Mood::kNoise, width, height), make_light(random), width, height,
              5);
  for (int size = 1; size <= 4; ++size) {
    compare(make_colours(random, Mood::kNoise, size, 1), make_light(random), size, 1, 5);
    compare(make_colours(random, Mood::kNoise, 1, size), make_light(random), 1, size, 5);
    compare(make_colours(random, Mood::kNoise, 100, size), make_light(random), 100, size, 7);
  }
}

TEST(FloatTransmission, FrameSizes) {
  Random random(test_seed());
  compare(make_colours(random, Mood::kGradient, 640, 360), {210, 205, 200}, 640, 360, 9);
  compare(make_colours(random, Mood::kBlocks, 1280, 720), {180, 220, 255}, 1280, 720, 6);
}

// A light byte of 0 takes every value but 0 to the lower bound.
TEST(FloatTransmission, LightOf0) {
  for (const int value : {1, 2, 128, 255}) {
    const Estimate result =
        estimate(grey_image(static_cast<uint8_t>(value)), {0, 0, 0}, kSide, kSide, 3);
    EXPECT_TRUE(planes_match(result.raw, plain(0.4f)));
    EXPECT_TRUE(planes_match(result.filtered, plain(0.4f)));
  }
}

TEST(FloatTransmission, EmptySizesWriteNothing) {
  Image image(3 * 400, 90);
  Colour light = {200, 200, 200};
  const int sizes[][2] = {{0, 0},   {0, 16},    {16, 0},       {-1, 16},     {16, -1},
                          {-1, -1}, {-20, -20}, {INT_MIN, 16}, {16, INT_MIN}};
  for (const auto& size : sizes) {
    GuardedBuffer<float> raw(400, kUnwritten);
    GuardedBuffer<float> filtered(400, kUnwritten);
    EstimateTPreview(image.data(), light.data(), filtered.data(), raw.data(), size[0], size[1], 5);
    EXPECT_TRUE(floats_are_untouched(raw, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
    EXPECT_TRUE(
        floats_are_untouched(filtered, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(FloatTransmission, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int width = 1; width <= 24; ++width) {
    const Image content = make_colours(random, Mood::kNoise, width, 17);
    const Colour light = make_light(random);
    PageEndBuffer<uint8_t> image(content);
    PageEndBuffer<uint8_t> light_bytes(Image(light.begin(), light.end()));
    PageEndBuffer<float> raw(content.size() / 3);
    PageEndBuffer<float> filtered(content.size() / 3);
    EstimateTPreview(image.data(), light_bytes.data(), filtered.data(), raw.data(), width, 17, 5);
    const Plane want = reference::raw_transmission(content.data(), light.data(), width, 17, 5);
    EXPECT_TRUE(planes_match(raw, want));
    EXPECT_TRUE(planes_match(filtered, reference::filtered_transmission(want, width, 17)));
  }
}

TEST(FloatTransmissionThreads, IndependentCalls) {
  Random random(test_seed());
  std::vector<Image> images;
  std::vector<Colour> lights;
  std::vector<Estimate> results(4);
  for (int i = 0; i < 4; ++i) {
    images.push_back(make_colours(random, Mood::kNoise, 60, 50));
    lights.push_back(make_light(random));
  }
  std::vector<std::thread> threads;
  for (size_t i = 0; i < 4; ++i)
    threads.emplace_back([&, i] {
      for (int round = 0; round < 3; ++round)
        results[i] = estimate(images[i], lights[i], 60, 50, static_cast<int>(2 * i + 1));
    });
  for (std::thread& thread : threads) thread.join();
  for (size_t i = 0; i < 4; ++i) {
    const Plane raw = reference::raw_transmission(images[i].data(), lights[i].data(), 60, 50,
                                                  static_cast<int>(2 * i + 1));
    EXPECT_TRUE(planes_match(results[i].raw, raw));
    EXPECT_TRUE(planes_match(results[i].filtered, reference::filtered_transmission(raw, 60, 50)));
  }
}

}  // namespace
}  // namespace haze::test
