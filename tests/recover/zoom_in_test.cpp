// Float planes to twice their size.
#include <gtest/gtest.h>

#include <cfloat>
#include <climits>
#include <cstdint>
#include <limits>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/zoom.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

constexpr uint8_t kUnwritten = 0xA5;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

void compare_zoom_in(const std::vector<float>& content, int width, int height) {
  GuardedBuffer<float> src(content);
  GuardedBuffer<float> dst(4 * content.size(), kUnwritten);
  std::vector<float> want(dst.size());
  ZoomIn_Linear_fPreview(src.data(), dst.data(), width, height);
  reference::zoom_in(content.data(), want.data(), width, height);
  ASSERT_TRUE(planes_match(dst, want, {{"width", width}, {"height", height}, {"row", 2 * width}}));
  ASSERT_TRUE(planes_match(src, content));
}

std::vector<float> zoomed_in(std::vector<float> src, int width, int height) {
  std::vector<float> dst(4 * src.size(), -1.0f);
  ZoomIn_Linear_fPreview(src.data(), dst.data(), width, height);
  return dst;
}

TEST(ZoomIn, OnePixel) {
  for (const float v : {0.0f, 0.3f, -7.5f, FLT_MAX})
    EXPECT_EQ(zoomed_in({v}, 1, 1), std::vector<float>(4, v));
}

TEST(ZoomIn, OneRow) {
  EXPECT_EQ(zoomed_in({0, 2}, 2, 1), (std::vector<float>{0, 1, 2, 2, 0, 1, 2, 2}));
}

TEST(ZoomIn, OneColumn) {
  EXPECT_EQ(zoomed_in({0, 2}, 1, 2), (std::vector<float>{0, 0, 1, 1, 2, 2, 2, 2}));
}

TEST(ZoomIn, TwoByTwo) {
  EXPECT_EQ(zoomed_in({0, 4, 8, 20}, 2, 2),
            (std::vector<float>{0, 2, 4, 4, 4, 8, 12, 12, 8, 14, 20, 20, 8, 14, 20, 20}));
}

TEST(ZoomIn, EverySizeUpTo40) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width)
    for (int height = 1; height <= 40; height += 1 + width % 2)
      compare_zoom_in(make_plane(random, random.one_of(kFloatMoods), width, height), width, height);
}

TEST(ZoomIn, WidthsUpTo100) {
  Random random(test_seed());
  for (int width = 41; width <= 100; ++width)
    compare_zoom_in(make_plane(random, random.one_of(kFloatMoods), width, 3), width, 3);
}

TEST(ZoomIn, FrameSizes) {
  Random random(test_seed());
  for (const FloatMood mood : kFloatMoods)
    compare_zoom_in(make_plane(random, mood, 160, 90), 160, 90);
  compare_zoom_in(make_plane(random, FloatMood::kUnit, 640, 360), 640, 360);
}

// Rows before columns: the mean of the rows' means rounds otherwise than that of the columns'.
TEST(ZoomIn, RowsAreDoubledFirst) {
  const float ulp = FLT_EPSILON;
  const std::vector<float> doubled =
      zoomed_in({1.0f, 1.0f + ulp, 1.0f + 2 * ulp, 1.0f + 2 * ulp}, 2, 2);
  // The mean of 1 and 1 + ulp is a tie that rounds to 1, and the one of 1 and 1 + 2 ulp is 1 + ulp.
  // By columns first it would be the mean of 1 + ulp and of 1 + 1.5 ulp, itself rounded to 1 + 2
  // ulp: a tie that rounds to 1 + 2 ulp.
  EXPECT_EQ(doubled[5], 1.0f + ulp);
}

// The sum is formed before it is halved.
TEST(ZoomIn, SumsMayOverflow) {
  const float infinity = std::numeric_limits<float>::infinity();
  const std::vector<float> doubled = zoomed_in({FLT_MAX, FLT_MAX}, 2, 1);
  EXPECT_EQ(doubled, (std::vector<float>{FLT_MAX, infinity, FLT_MAX, FLT_MAX, FLT_MAX, infinity,
                                         FLT_MAX, FLT_MAX}));
}

TEST(ZoomIn, AnyBitPattern) {
  Random random(test_seed());
  for (int i = 0; i < 20; ++i) {
    const int width = random.between(1, 40);
    const int height = random.between(1, 20);
    std::vector<float> content(area(width, height));
    for (float& value : content) value = float_of_bits(static_cast<uint32_t>(random.next() >> 32));
    compare_zoom_in(content, width, height);
  }
}

TEST(ZoomIn, SubnormalsInfinitiesAndNoNumbers) {
  Random random(test_seed());
  const float infinity = std::numeric_limits<float>::infinity();
  const float choices[] = {0.0f,
                           -0.0f,
                           infinity,
                           -infinity,
                           std::numeric_limits<float>::quiet_NaN(),
                           FLT_MIN,
                           -FLT_MIN,
                           float_of_bits(1),
                           float_of_bits(3),
                           float_of_bits(0x007FFFFF),
                           1.0f};
  for (int i = 0; i < 20; ++i) {
    std::vector<float> content(area(19, 7));
    for (float& value : content) value = random.one_of(choices);
    compare_zoom_in(content, 19, 7);
  }
}

TEST(ZoomIn, TouchesNothingPastTheEnd) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width) {
    PageEndBuffer<float> src(make_plane(random, FloatMood::kUnit, width, 3));
    PageEndBuffer<float> dst(4 * src.size());
    std::vector<float> want(dst.size());
    ZoomIn_Linear_fPreview(src.data(), dst.data(), width, 3);
    reference::zoom_in(src.data(), want.data(), width, 3);
    EXPECT_TRUE(planes_match(dst, want, {{"width", width}, {"row", 2 * width}}));
  }
}

TEST(ZoomIn, EmptySizesWriteNothing) {
  const std::vector<float> src(512, 1.0f);
  const int sizes[][2] = {{0, 0},   {0, 4},   {4, 0},       {-2, 4},     {4, -2},
                          {-4, -4}, {-1, -1}, {INT_MIN, 4}, {4, INT_MIN}};
  for (const auto& size : sizes) {
    GuardedBuffer<float> dst(512, kUnwritten);
    ZoomIn_Linear_fPreview(src.data() + 256, dst.data() + 256, size[0], size[1]);
    EXPECT_TRUE(floats_are_untouched(dst, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
  }
}

}  // namespace
}  // namespace haze::test
