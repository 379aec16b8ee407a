// Running minima of lines, and the single-threaded square minimum filter with its histogram.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/min_filter.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

constexpr uint8_t kUnwritten = 0xA5;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

std::vector<int> bins_of(const GuardedBuffer<int>& histogram) {
  return std::vector<int>(histogram.data(), histogram.data() + histogram.size());
}

// All three forms on one line; outputs `stride` bytes apart leave the bytes between them.
void compare_line(const std::vector<uint8_t>& content, int stride, int radius) {
  const int count = static_cast<int>(content.size());
  const std::vector<uint8_t> minima = reference::line_minimum(content.data(), count, radius);
  std::vector<uint8_t> strided(area(count - 1, stride) + 1, kUnwritten);
  for (size_t i = 0; i < minima.size(); ++i) strided[i * static_cast<size_t>(stride)] = minima[i];
  const Arguments arguments = {{"samples", count}, {"stride", stride}, {"radius", radius}};

  GuardedBuffer<uint8_t> src(content);
  GuardedBuffer<uint8_t> dst(strided.size(), kUnwritten);
  getMinChannelPreview(src.data(), dst.data(), count, stride, radius);
  ASSERT_TRUE(bytes_match(dst, strided, arguments)) << "without histogram";

  GuardedBuffer<uint8_t> counted(strided.size(), kUnwritten);
  GuardedBuffer<int> histogram(std::vector<int>(256, 1000));
  getMCandHistPreview(src.data(), counted.data(), histogram.data(), count, stride, radius);
  ASSERT_TRUE(bytes_match(counted, strided, arguments)) << "with histogram";
  std::vector<int> bins = reference::histogram_of(minima.data(), count);
  for (int& bin : bins) bin += 1000;
  ASSERT_EQ(bins_of(histogram), bins) << count << " samples, radius " << radius;

  GuardedBuffer<uint8_t> row(minima.size(), kUnwritten);
  getMinChannel_horPreview(src.data(), row.data(), count, stride - 2, radius);
  ASSERT_TRUE(bytes_match(row, minima, arguments)) << "row";
  ASSERT_TRUE(bytes_match(src, content));
}

// Lengths from one sample to well past the smallest line with an interior, 2 * radius + 2.
TEST(MinLine, EveryRadiusAndLength) {
  Random random(test_seed());
  for (int radius = 0; radius <= 20; ++radius)
    for (int count = 1; count <= 64; ++count)
      compare_line(make_image(random, random.one_of(kMoods), count, 1), random.between(1, 4),
                   radius);
}

// With few values minima are tied, so that the place of a tied one decides when a window is
// searched again.
TEST(MinLine, EveryLineOfThreeValues) {
  constexpr int kCount = 8;
  for (int radius = 0; radius <= 4; ++radius)
    for (int number = 0; number < 6561; ++number) {
      std::vector<uint8_t> line;
      for (int i = 0, digits = number; i < kCount; ++i, digits /= 3)
        line.push_back(static_cast<uint8_t>(digits % 3));
      compare_line(line, 1, radius);
      if (HasFatalFailure()) return;
    }
}

// Rising lines lose their minimum at every step, falling ones at none.
TEST(MinLine, RampsAndTeeth) {
  for (int radius = 0; radius <= 20; ++radius) {
    std::vector<uint8_t> rising;
    std::vector<uint8_t> teeth;
    for (int i = 0; i < 128; ++i) {
      rising.push_back(static_cast<uint8_t>(2 * i));
      teeth.push_back(static_cast<uint8_t>(i % (radius + 2) * 3));
    }
    const std::vector<uint8_t> falling(rising.rbegin(), rising.rend());
    const std::vector<uint8_t> backward(teeth.rbegin(), teeth.rend());
    for (const auto& line : {rising, falling, teeth, backward}) compare_line(line, 2, radius);
  }
}

TEST(MinLine, LengthsUpTo300) {
  Random random(test_seed());
  for (int count = 65; count <= 300; ++count)
    compare_line(make_image(random, random.one_of(kMoods), count, 1), random.between(1, 3),
                 random.between(0, 40));
}

TEST(MinLine, LongLines) {
  Random random(test_seed());
  for (const Mood mood : kMoods)
    for (const int radius : {1, 7, 15, 100, 639, 640, 641})
      compare_line(make_image(random, mood, 1280, 1), 3, radius);
}

TEST(MinLine, RadiusBeyondTheLine) {
  Random random(test_seed());
  for (const int count : {1, 2, 3, 10, 33})
    for (const int radius : {count, 1000, 1 << 30, INT_MAX / 2, INT_MAX / 2 + 1, INT_MAX})
      compare_line(make_image(random, Mood::kNoise, count, 1), 1, radius);
}

TEST(MinLine, RowCountHasNoEffect) {
  std::vector<uint8_t> line = {5, 3, 9, 9, 9, 9, 9, 1};
  for (const int rows : {0, 1, -1, 8, 100, INT_MAX, INT_MIN}) {
    std::vector<uint8_t> row(line.size());
    getMinChannel_horPreview(line.data(), row.data(), 8, rows, 1);
    EXPECT_EQ(row, (std::vector<uint8_t>{3, 3, 3, 9, 9, 9, 1, 1})) << rows;
  }
}

TEST(MinLine, TouchesNothingPastTheEnd) {
  Random random(test_seed());
  for (int count = 1; count <= 140; ++count) {
    const int radius = random.between(0, count);
    PageEndBuffer<uint8_t> src(make_image(random, Mood::kNoise, count, 1));
    const std::vector<uint8_t> want = reference::line_minimum(src.data(), count, radius);
    PageEndBuffer<uint8_t> dst(want.size());
    getMinChannelPreview(src.data(), dst.data(), count, 1, radius);
    EXPECT_TRUE(bytes_match(dst, want, {{"samples", count}, {"radius", radius}}));
    std::fill_n(dst.data(), dst.size(), kUnwritten);
    getMinChannel_horPreview(src.data(), dst.data(), count, 1, radius);
    EXPECT_TRUE(bytes_match(dst, want, {{"samples", count}, {"radius", radius}}));
    std::fill_n(dst.data(), dst.size(), kUnwritten);
    std::vector<int> bins(256);
    getMCandHistPreview(src.data(), dst.data(), bins.data(), count, 1, radius);
    EXPECT_TRUE(bytes_match(dst, want, {{"samples", count}, {"radius", radius}}));
  }
}

TEST(MinLine, NoSamplesAndNegativeRadiiWriteNothing) {
  std::vector<uint8_t> src(64, 70);
  const int cases[][2] = {{0, 0},   {-1, 0},      {0, 3},  {-8, 3},  {INT_MIN, 1}, {8, -1},
                          {8, -20}, {8, INT_MIN}, {1, -1}, {-1, -1}, {0, -1},      {-8, -8}};
  for (const auto& arguments : cases) {
    GuardedBuffer<uint8_t> dst(64, kUnwritten);
    GuardedBuffer<int> histogram(std::vector<int>(256, 5));
    getMinChannelPreview(src.data() + 32, dst.data() + 32, arguments[0], 1, arguments[1]);
    getMinChannel_horPreview(src.data() + 32, dst.data() + 32, arguments[0], 1, arguments[1]);
    getMCandHistPreview(src.data() + 32, dst.data() + 32, histogram.data(), arguments[0], 1,
                        arguments[1]);
    EXPECT_TRUE(all_bytes_are(dst, kUnwritten, {{"n", arguments[0]}, {"radius", arguments[1]}}));
    EXPECT_EQ(bins_of(histogram), std::vector<int>(256, 5));
  }
}

void compare_image(const std::vector<uint8_t>& content, int width, int height, int radius,
                   size_t skew = 0) {
  const std::vector<uint8_t> want =
      reference::square_minimum(content.data(), width, height, radius);
  std::vector<int> bins = reference::histogram_of(want.data(), width * height);
  GuardedBuffer<uint8_t> src(content, skew);
  GuardedBuffer<uint8_t> dst(content.size(), kUnwritten, skew);
  // The bins are added to.
  GuardedBuffer<int> histogram(std::vector<int>(256, 7));
  for (int& bin : bins) bin += 7;
  CalculateDarkChannelPreview(src.data(), dst.data(), histogram.data(), width, height, radius);
  ASSERT_TRUE(bytes_match(
      dst, want, {{"width", width}, {"height", height}, {"radius", radius}, {"row", width}}));
  ASSERT_EQ(bins_of(histogram), bins) << width << " x " << height << ", radius " << radius;
  ASSERT_TRUE(bytes_match(src, content));
}

// The smallest sides with whole windows, one less and one more.
TEST(DarkChannel, EveryRadiusAroundItsSmallestSize) {
  Random random(test_seed());
  for (int radius = 0; radius <= 20; ++radius)
    for (int extra_width = -1; extra_width <= 1; ++extra_width)
      for (int extra_height = -1; extra_height <= 1; ++extra_height) {
        const int width = std::max(2 * radius + 1 + extra_width, 1);
        const int height = std::max(2 * radius + 1 + extra_height, 1);
        compare_image(make_image(random, random.one_of(kMoods), width, height), width, height,
                      radius);
      }
}

TEST(DarkChannel, EverySideUpTo40) {
  Random random(test_seed());
  for (int side = 1; side <= 40; ++side)
    for (const Mood mood : kMoods) {
      const int other = random.between(1, 40);
      compare_image(make_image(random, mood, side, other), side, other, random.between(0, 20));
      compare_image(make_image(random, mood, other, side), other, side, random.between(0, 6));
    }
}

TEST(DarkChannel, FrameSizes) {
  Random random(test_seed());
  compare_image(make_image(random, Mood::kNoise, 640, 360), 640, 360, 7);
  compare_image(make_image(random, Mood::kGradient, 1280, 720), 1280, 720, 15);
  compare_image(make_image(random, Mood::kBlocks, 641, 359), 641, 359, 20);
}

TEST(DarkChannel, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew)
    compare_image(make_image(random, Mood::kNoise, 37, 23), 37, 23, random.between(0, 8), skew);
}

TEST(DarkChannel, RadiusZeroCopies) {
  Random random(test_seed());
  std::vector<uint8_t> src = make_image(random, Mood::kNoise, 33, 17);
  std::vector<uint8_t> dst(src.size());
  std::vector<int> bins(256);
  CalculateDarkChannelPreview(src.data(), dst.data(), bins.data(), 33, 17, 0);
  EXPECT_EQ(dst, src);
  EXPECT_EQ(bins, reference::histogram_of(src.data(), 33 * 17));
}

TEST(DarkChannel, ConstantMap) {
  std::vector<uint8_t> src(area(40, 30), 93);
  std::vector<uint8_t> dst(src.size());
  std::vector<int> bins(256);
  CalculateDarkChannelPreview(src.data(), dst.data(), bins.data(), 40, 30, 5);
  EXPECT_TRUE(all_bytes_are(dst, 93));
  std::vector<int> want(256);
  want[93] = 40 * 30;
  EXPECT_EQ(bins, want);
}

TEST(DarkChannel, OneDarkPixelGrowsToASquare) {
  constexpr int kWidth = 19;
  constexpr int kHeight = 15;
  for (const int radius : {1, 3, 7})
    for (int y0 = 0; y0 < kHeight; ++y0)
      for (int x0 = 0; x0 < kWidth; ++x0) {
        std::vector<uint8_t> src(area(kWidth, kHeight), 255);
        src[area(y0, kWidth) + static_cast<size_t>(x0)] = 0;
        std::vector<uint8_t> want(src.size(), 255);
        int dark = 0;
        for (int y = std::max(0, y0 - radius); y <= std::min(kHeight - 1, y0 + radius); ++y)
          for (int x = std::max(0, x0 - radius); x <= std::min(kWidth - 1, x0 + radius); ++x) {
            want[area(y, kWidth) + static_cast<size_t>(x)] = 0;
            ++dark;
          }
        std::vector<uint8_t> dst(src.size(), kUnwritten);
        std::vector<int> bins(256);
        CalculateDarkChannelPreview(src.data(), dst.data(), bins.data(), kWidth, kHeight, radius);
        ASSERT_TRUE(bytes_match(dst, want, {{"x", x0}, {"y", y0}, {"row", kWidth}}));
        ASSERT_EQ(bins[0], dark);
        ASSERT_EQ(bins[255], kWidth * kHeight - dark);
      }
}

TEST(DarkChannel, SecondCallDoublesTheHistogram) {
  Random random(test_seed());
  std::vector<uint8_t> src = make_image(random, Mood::kBlocks, 50, 40);
  std::vector<uint8_t> dst(src.size());
  std::vector<int> bins(256);
  CalculateDarkChannelPreview(src.data(), dst.data(), bins.data(), 50, 40, 4);
  const std::vector<int> once = bins;
  CalculateDarkChannelPreview(src.data(), dst.data(), bins.data(), 50, 40, 4);
  for (size_t v = 0; v < 256; ++v) EXPECT_EQ(bins[v], 2 * once[v]) << v;
}

TEST(DarkChannel, RadiusBeyondTheImage) {
  Random random(test_seed());
  for (const int radius : {20, 1000, 1 << 30, INT_MAX / 2 + 1, INT_MAX})
    compare_image(make_image(random, Mood::kNoise, 21, 10), 21, 10, radius);
}

TEST(DarkChannel, EmptySizesAndNegativeRadiiWriteNothing) {
  std::vector<uint8_t> src(1024, 70);
  const int cases[][3] = {{0, 0, 0},    {0, 8, 1},   {8, 0, 1},       {-8, 8, 1},      {8, -8, 1},
                          {-8, -8, 1},  {-8, -8, 0}, {INT_MIN, 8, 0}, {8, INT_MIN, 0}, {8, 8, -1},
                          {8, 8, -100}, {1, 1, -1},  {8, 8, INT_MIN}};
  for (const auto& arguments : cases) {
    GuardedBuffer<uint8_t> dst(1024, kUnwritten);
    GuardedBuffer<int> histogram(std::vector<int>(256, 5));
    CalculateDarkChannelPreview(src.data() + 512, dst.data() + 512, histogram.data(), arguments[0],
                                arguments[1], arguments[2]);
    EXPECT_TRUE(all_bytes_are(
        dst, kUnwritten,
        {{"width", arguments[0]}, {"height", arguments[1]}, {"radius", arguments[2]}}));
    EXPECT_EQ(bins_of(histogram), std::vector<int>(256, 5));
  }
}

}  // namespace
}  // namespace haze::test
