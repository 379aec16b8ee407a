#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/box_integer.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using reference::kWindow64;
using reference::window_of_radius;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

enum class Yardstick { kWindows, kPrefixSums };

std::vector<uint8_t> expected_means(const std::vector<uint8_t>& src, int width, int height,
                                    reference::BoxWindow window, Yardstick yardstick) {
  std::vector<uint8_t> means(src.size(), 0x5A);
  if (yardstick == Yardstick::kWindows)
    reference::box_mean_by_windows(src.data(), means.data(), width, height, window);
  else
    reference::box_mean(src.data(), means.data(), width, height, window);
  return means;
}

std::vector<uint8_t> mean64(std::vector<uint8_t> src, int width, int height, int radius = 30) {
  std::vector<uint8_t> dst(src.size(), 0xA5);
  std::vector<short> scratch(static_cast<size_t>(width));
  AverageFilterShort64_u8(src.data(), dst.data(), width, height, radius, scratch.data());
  return dst;
}

std::vector<uint8_t> mean_of_radius(std::vector<uint8_t> src, int width, int height, int radius) {
  std::vector<uint8_t> dst(src.size(), 0xA5);
  std::vector<int> scratch(static_cast<size_t>(width));
  AverageFilter_u8(src.data(), dst.data(), width, height, radius, scratch.data());
  return dst;
}

template <class Sum>
void expect_column_sums(const GuardedBuffer<Sum>& scratch, const std::vector<int>& sums) {
  for (size_t i = 0; i < sums.size(); ++i)
    ASSERT_EQ(static_cast<int>(scratch[i]), sums[i]) << "column sum " << i;
}

// Output, column sums, and every byte around the buffers.
void compare_mean64(const std::vector<uint8_t>& src, int width, int height, Yardstick yardstick) {
  GuardedBuffer<uint8_t> source(src);
  GuardedBuffer<uint8_t> dst(src.size(), 0xA5);
  GuardedBuffer<short> scratch(static_cast<size_t>(width), 0xEE);
  AverageFilterShort64_u8(source.data(), dst.data(), width, height, 30, scratch.data());
  EXPECT_TRUE(bytes_match(dst, expected_means(src, width, height, kWindow64, yardstick),
                          {{"width", width}, {"height", height}, {"row", width}}));
  EXPECT_TRUE(bytes_match(source, src));
  expect_column_sums(scratch,
                     reference::box_column_sums_at_end(src.data(), width, height, kWindow64));
}

void compare_radius(const std::vector<uint8_t>& src, int width, int height, int radius,
                    Yardstick yardstick) {
  const reference::BoxWindow window = window_of_radius(radius);
  GuardedBuffer<uint8_t> source(src);
  GuardedBuffer<uint8_t> dst(src.size(), 0xA5);
  GuardedBuffer<int> scratch(static_cast<size_t>(width), 0xEE);
  AverageFilter_u8(source.data(), dst.data(), width, height, radius, scratch.data());
  EXPECT_TRUE(
      bytes_match(dst, expected_means(src, width, height, window, yardstick),
                  {{"radius", radius}, {"width", width}, {"height", height}, {"row", width}}));
  EXPECT_TRUE(bytes_match(source, src));
  expect_column_sums(scratch, reference::box_column_sums_at_end(src.data(), width, height, window));
}

TEST(BoxReference, PrefixSumsEqualWindows) {
  Random random(test_seed());
  const int sizes[][2] = {{64, 64}, {70, 65}, {33, 90}, {7, 7}};
  for (const auto& size : sizes)
    for (const Mood mood : kMoods) {
      const std::vector<uint8_t> src = make_image(random, mood, size[0], size[1]);
      for (const reference::BoxWindow window :
           {kWindow64, window_of_radius(1), window_of_radius(3), reference::BoxWindow{2, 9}})
        EXPECT_TRUE(
            bytes_match(expected_means(src, size[0], size[1], window, Yardstick::kPrefixSums),
                        expected_means(src, size[0], size[1], window, Yardstick::kWindows)));
    }
}

TEST(Box64, ConstantImageStaysConstant) {
  const int sizes[][2] = {{64, 64}, {65, 129}, {128, 70}};
  for (const auto& size : sizes)
    for (const int value : {0, 1, 127, 128, 254, 255}) {
      const std::vector<uint8_t> src(area(size[0], size[1]), static_cast<uint8_t>(value));
      EXPECT_TRUE(bytes_match(mean64(src, size[0], size[1]), src, {{"width", size[0]}}));
    }
}

TEST(Box64, RadiusHasNoEffect) {
  Random random(test_seed());
  const std::vector<uint8_t> src = make_image(random, Mood::kNoise, 97, 80);
  const std::vector<uint8_t> means = mean64(src, 97, 80, 30);
  for (const int radius : {0, 100, 1, -1, 32, INT_MAX, INT_MIN})
    EXPECT_TRUE(bytes_match(mean64(src, 97, 80, radius), means, {{"radius", radius}}));
}

TEST(Box64, CornersOf128x128) {
  constexpr int kSize = 128;
  Random random(test_seed());
  for (const Mood mood : kMoods) {
    const std::vector<uint8_t> src = make_image(random, mood, kSize, kSize);
    const std::vector<uint8_t> means = mean64(src, kSize, kSize);
    const auto mean_of = [&](int first, int last) {
      int sum = 0;
      for (int y = first; y <= last; ++y)
        for (int x = first; x <= last; ++x) sum += src[area(y, kSize) + static_cast<size_t>(x)];
      return sum / ((last - first + 1) * (last - first + 1));
    };
    EXPECT_EQ(means[0], mean_of(0, 31));
    EXPECT_EQ(means[33 * kSize + 33], mean_of(1, 64));
    EXPECT_EQ(means[kSize * kSize - 1], mean_of(95, 127));
  }
}

TEST(Box64, Exactly64x64HasNoMiddleBand) {
  Random random(test_seed());
  for (const Mood mood : kMoods)
    compare_mean64(make_image(random, mood, 64, 64), 64, 64, Yardstick::kWindows);
}

// 255 / count truncated: 0 wherever the window holds more than 255 pixels, which is everywhere
// here.
TEST(Box64, SingleBrightPixelVanishes) {
  std::vector<uint8_t> src(area(130, 140), 0);
  src[70 * 130 + 65] = 255;
  EXPECT_TRUE(all_bytes_are(mean64(src, 130, 140), 0));
}

// 17 bright pixels: 17 * 255 / 4096 = 1 where all of them are in a full window.
TEST(Box64, TruncatesTheMean) {
  std::vector<uint8_t> src(area(192, 192), 0);
  for (size_t i = 0; i < 17; ++i) src[96 * 192 + 90 + i] = 255;
  const std::vector<uint8_t> means = mean64(src, 192, 192);
  EXPECT_EQ(means[96 * 192 + 96], 1);
  EXPECT_TRUE(bytes_match(means, expected_means(src, 192, 192, kWindow64, Yardstick::kPrefixSums)));
  src[96 * 192 + 90] = 0;
  EXPECT_EQ(mean64(src, 192, 192)[96 * 192 + 96], 0);
}

TEST(Box64, SmallestSizes) {
  Random random(test_seed());
  for (int width = 64; width <= 70; ++width)
    for (int height = 64; height <= 70; ++height)
      compare_mean64(make_image(random, random.one_of(kMoods), width, height), width, height,
                     Yardstick::kPrefixSums);
  compare_mean64(make_image(random, Mood::kNoise, 67, 69), 67, 69, Yardstick::kWindows);
}

TEST(Box64, WidthsAcrossVectorSteps) {
  Random random(test_seed());
  for (int width = 96; width <= 136; ++width)
    compare_mean64(make_image(random, Mood::kNoise, width, 66), width, 66, Yardstick::kPrefixSums);
}

TEST(Box64, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{65, 129}, {129, 65}, {65, 359}, {320, 240}, {639, 359}, {640, 360}};
  for (const auto& size : sizes)
    for (const Mood mood : {Mood::kNoise, Mood::kNearMaximum, Mood::kBlocks})
      compare_mean64(make_image(random, mood, size[0], size[1]), size[0], size[1],
                     Yardstick::kPrefixSums);
}

// 2049 columns of 255: the row sum of 64 x 64 x 255 stays exact however wide the image.
TEST(Box64, WiderThanAnyFrame) {
  Random random(test_seed());
  compare_mean64(make_image(random, Mood::kNearMaximum, 2049, 64), 2049, 64,
                 Yardstick::kPrefixSums);
  compare_mean64(make_image(random, Mood::kNearMaximum, 64, 1111), 64, 1111,
                 Yardstick::kPrefixSums);
}

// Rows of up to 4096 columns are summed in another way where there are vectors.
TEST(Box64, WidestRowOfPrefixSums) {
  Random random(test_seed());
  for (const int width : {4095, 4096, 4097})
    compare_mean64(make_image(random, Mood::kNearMaximum, width, 65), width, 65,
                   Yardstick::kPrefixSums);
}

TEST(Box64, BelowTheMinimumWritesNothing) {
  std::vector<uint8_t> src(area(200, 200), 99);
  const int sizes[][2] = {{63, 64},  {64, 63},   {63, 63},   {0, 64},       {64, 0},
                          {-1, 64},  {64, -1},   {0, 0},     {1, 1},        {63, 200},
                          {200, 63}, {-64, -64}, {-64, 128}, {INT_MIN, 64}, {64, INT_MIN},
                          {-1, -1},  {-200, -80}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> dst(src.size(), 0xA5);
    GuardedBuffer<short> scratch(200, 0x5A);
    AverageFilterShort64_u8(src.data(), dst.data(), size[0], size[1], 30, scratch.data());
    EXPECT_TRUE(all_bytes_are(dst, 0xA5, {{"width", size[0]}, {"height", size[1]}}));
    for (size_t i = 0; i < scratch.size(); ++i) ASSERT_EQ(scratch[i], 0x5A5A);
  }
}

TEST(Box64, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int width = 64; width <= 81; ++width) {
    PageEndBuffer<uint8_t> src(make_image(random, Mood::kNoise, width, 66));
    PageEndBuffer<uint8_t> dst(src.size());
    PageEndBuffer<short> scratch(static_cast<size_t>(width));
    AverageFilterShort64_u8(src.data(), dst.data(), width, 66, 30, scratch.data());
    std::vector<uint8_t> want(src.size());
    reference::box_mean(src.data(), want.data(), width, 66, kWindow64);
    EXPECT_TRUE(bytes_match(dst, want, {{"width", width}}));
  }
}

TEST(BoxRadius, ConstantImageStaysConstant) {
  for (const int radius : {1, 2, 7, 20})
    for (const int value : {0, 1, 127, 128, 254, 255}) {
      const int width = 2 * radius + 4;
      const int height = 2 * radius + 1;
      const std::vector<uint8_t> src(area(width, height), static_cast<uint8_t>(value));
      EXPECT_TRUE(
          bytes_match(mean_of_radius(src, width, height, radius), src, {{"radius", radius}}));
    }
}

TEST(BoxRadius, Radius1Of3x3) {
  const std::vector<uint8_t> src = {10, 20, 31, 40, 50, 60, 70, 80, 95};
  // Corners: means of 2 x 2; edge centres: of 2 x 3; centre: of all nine.
  const std::vector<uint8_t> want = {120 / 4, 211 / 6, 161 / 4, 270 / 6, 456 / 9,
                                     336 / 6, 240 / 4, 395 / 6, 285 / 4};
  EXPECT_TRUE(bytes_match(mean_of_radius(src, 3, 3, 1), want));
}

TEST(BoxRadius, SingleBrightPixel) {
  std::vector<uint8_t> src(81, 0);
  src[4 * 9 + 4] = 255;
  std::vector<uint8_t> want(81, 0);
  for (size_t y = 2; y <= 6; ++y)
    for (size_t x = 2; x <= 6; ++x) want[y * 9 + x] = 255 / 25;
  EXPECT_TRUE(bytes_match(mean_of_radius(src, 9, 9, 2), want));
}

TEST(BoxRadius, Radius1To20OnTheSmallestSizes) {
  Random random(test_seed());
  for (int radius = 1; radius <= 20; ++radius)
    for (const Mood mood : kMoods)
      for (int extra = 0; extra < 3; ++extra) {
        const int width = 2 * radius + 1 + extra;
        const int height = 2 * radius + 1 + (extra + radius) % 3;
        compare_radius(make_image(random, mood, width, height), width, height, radius,
                       Yardstick::kWindows);
      }
}

// Up to 63 a column of the window sums to less than 2^15.
TEST(BoxRadius, LargestRadiusOfPrefixSums) {
  Random random(test_seed());
  for (const int radius : {31, 32, 62, 63, 64})
    for (const int extra : {0, 1, 30, 33}) {
      const int width = 2 * radius + 1 + extra;
      const int height = 2 * radius + 2;
      compare_radius(make_image(random, Mood::kNearMaximum, width, height), width, height, radius,
                     Yardstick::kPrefixSums);
    }
}

TEST(BoxRadius, RandomSizes) {
  Random random(test_seed());
  for (int i = 0; i < 60; ++i) {
    const int radius = random.between(1, 20);
    const int width = random.between(2 * radius + 1, 120);
    const int height = random.between(2 * radius + 1, 120);
    compare_radius(make_image(random, random.one_of(kMoods), width, height), width, height, radius,
                   Yardstick::kPrefixSums);
  }
}

TEST(BoxRadius, FrameSize) {
  Random random(test_seed());
  compare_radius(make_image(random, Mood::kNoise, 640, 360), 640, 360, 30, Yardstick::kPrefixSums);
}

// Window sums above 2^24 are no longer exact in single precision.
TEST(BoxRadius, WindowsTooLargeForFloat) {
  Random random(test_seed());
  for (const int radius : {128, 131, 200}) {
    const int width = 2 * radius + 1 + radius % 3;
    const int height = 2 * radius + 2;
    compare_radius(make_image(random, Mood::kNearMaximum, width, height), width, height, radius,
                   Yardstick::kPrefixSums);
    compare_radius(std::vector<uint8_t>(area(width, height), 255), width, height, radius,
                   Yardstick::kPrefixSums);
    compare_radius(make_image(random, Mood::kNoise, width, height), width, height, radius,
                   Yardstick::kPrefixSums);
    // One less than a multiple of the window's size: the quotient must not be rounded up.
    std::vector<uint8_t> almost(area(width, height), 255);
    almost[area(height / 2, width) + static_cast<size_t>(width / 2)] = 254;
    compare_radius(almost, width, height, radius, Yardstick::kPrefixSums);
  }
}

TEST(BoxRadius, BelowTheMinimumWritesNothing) {
  std::vector<uint8_t> src(area(64, 64), 99);
  const int cases[][3] = {
      {2, 3, 1},  {3, 2, 1},    {2, 2, 1},    {0, 3, 1},       {3, 0, 1},       {-1, 3, 1},
      {3, -1, 1}, {40, 64, 20}, {64, 40, 20}, {-3, -3, 1},     {INT_MIN, 3, 1}, {3, INT_MIN, 1},
      {9, 9, 0},  {9, 9, -1},   {9, 9, -4},   {9, 9, INT_MAX}, {9, 9, INT_MIN}, {64, 64, 1 << 30}};
  for (const auto& sizes : cases) {
    GuardedBuffer<uint8_t> dst(src.size(), 0xA5);
    GuardedBuffer<int> scratch(64, 0x5A);
    AverageFilter_u8(src.data(), dst.data(), sizes[0], sizes[1], sizes[2], scratch.data());
    EXPECT_TRUE(all_bytes_are(dst, 0xA5,
                              {{"width", sizes[0]}, {"height", sizes[1]}, {"radius", sizes[2]}}));
    for (size_t i = 0; i < scratch.size(); ++i) ASSERT_EQ(scratch[i], 0x5A5A5A5A);
  }
}

TEST(BoxRadius, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int width = 9; width <= 26; ++width) {
    PageEndBuffer<uint8_t> src(make_image(random, Mood::kNoise, width, 9));
    PageEndBuffer<uint8_t> dst(src.size());
    PageEndBuffer<int> scratch(static_cast<size_t>(width));
    AverageFilter_u8(src.data(), dst.data(), width, 9, 4, scratch.data());
    std::vector<uint8_t> want(src.size());
    reference::box_mean(src.data(), want.data(), width, 9, window_of_radius(4));
    EXPECT_TRUE(bytes_match(dst, want, {{"width", width}}));
  }
}

}  // namespace
}  // namespace haze::test
