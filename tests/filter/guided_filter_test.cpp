#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/box_float.h"
#include "tests/reference/guided_filter.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using reference::Averaged;
using Plane = std::vector<float>;

constexpr uint8_t kUnwritten = 0xA5;
constexpr float kInfinity = std::numeric_limits<float>::infinity();

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

// Returns the codes, after a comparison with the reference.
std::vector<uint8_t> compare(const Plane& plane, const Plane& guide, int width, int height,
                             int radius) {
  GuardedBuffer<float> p(plane);
  GuardedBuffer<float> g(guide);
  GuardedBuffer<uint8_t> out(plane.size(), kUnwritten);
  GuidedFilterPreview(p.data(), g.data(), out.data(), width, height, radius);
  EXPECT_TRUE(
      bytes_match(out, reference::guided_filter(plane.data(), guide.data(), width, height, radius),
                  {{"radius", radius}, {"width", width}, {"height", height}, {"row", width}}));
  EXPECT_TRUE(planes_match(p, plane));
  EXPECT_TRUE(planes_match(g, guide));
  return {out.data(), out.data() + out.size()};
}

// A transmission with soft edges below a guide that follows it, as the filter is meant to be used.
Plane smooth_plane(Random& random, int width, int height, float noise) {
  const float slope = float_between(random, -0.6f, 0.6f);
  const int edge = random.between(1, width);
  Plane plane;
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const float across = static_cast<float>(x) / static_cast<float>(width);
      const float step = x + y < edge ? 0.2f : 0.5f;
      plane.push_back(step + slope * across + float_between(random, -noise, noise));
    }
  return plane;
}

// So far below the guide that the result is the guide itself.
Plane far_below(size_t count) { return Plane(count, -1000.0f); }

std::vector<uint8_t> codes_of_guide(const Plane& guide, int width, int height) {
  return compare(far_below(guide.size()), guide, width, height, 1);
}

TEST(GuidedFilter, HalfEverywhereGives60) {
  for (const int radius : {1, 2, 5, 20}) {
    const int width = 2 * radius + 1;
    const Plane half(area(width, width + 3), 0.5f);
    EXPECT_TRUE(all_bytes_are(compare(half, half, width, width + 3, radius), 60));
  }
}

TEST(GuidedFilter, ZeroVarianceDividesByEpsilon) {
  constexpr int kWidth = 33;
  constexpr int kHeight = 29;
  Random random(test_seed());
  // The filtered plane's square is 1/4 everywhere, and the guide's mean is 1/2 in many windows.
  Plane plane(area(kWidth, kHeight));
  Plane guide(plane.size());
  for (float& value : plane) value = random.between(0, 1) == 0 ? 0.5f : -0.5f;
  for (float& value : guide) value = 0.5f * static_cast<float>(random.between(0, 2));
  const auto mean = [&](Averaged quantity) {
    return reference::box_mean_float(guide.data(), plane.data(), quantity, kWidth, kHeight, 1);
  };
  const Plane mean_guide = mean(Averaged::kFirst);
  const Plane mean_plane = mean(Averaged::kSecond);
  const Plane mean_product = mean(Averaged::kProduct);
  const Plane mean_square = mean(Averaged::kSecondSquared);
  int clamped = 0;
  for (size_t i = 0; i < plane.size(); ++i) {
    if (mean_square[i] != mean_guide[i] * mean_guide[i]) continue;
    const float covariance = std::fabs(mean_product[i] - mean_guide[i] * mean_plane[i]);
    const float slope =
        reference::guided_slope(mean_guide[i], mean_plane[i], mean_product[i], mean_square[i]);
    if (covariance >= 1.0e-4f) {
      EXPECT_EQ(slope, 1.0f);
      ++clamped;
    }
  }
  EXPECT_GT(clamped, 10);
  compare(plane, guide, kWidth, kHeight, 1);
}

// The subtracted mean belongs to the guide, the moment to the filtered plane; with these two planes
// apart every other pairing gives other codes.
TEST(GuidedFilter, PairsMomentAndMeanOfDifferentPlanes) {
  Random random(test_seed());
  for (int i = 0; i < 20; ++i) {
    const Plane plane = smooth_plane(random, 24, 20, 0.05f);
    Plane guide = plane;
    for (float& value : guide) value = 0.8f * value - 0.1f;
    const std::vector<uint8_t> codes = compare(plane, guide, 24, 20, 3);
    EXPECT_FALSE(bytes_match(codes, compare(guide, plane, 24, 20, 3)));
  }
}

// One pixel per number: a plane far below leaves the guide's numbers as they are.
TEST(GuidedFilter, EveryStepOfTheCode) {
  Plane guide;
  std::vector<uint8_t> want;
  for (int code = 0; code <= 159; ++code) {
    const float t = (static_cast<float>(code) + 40.0f) / 200.0f;
    for (int step = -4; step <= 4; ++step) {
      guide.push_back(ulps_from(t, step));
      want.push_back(reference::guided_code(guide.back()));
    }
  }
  ASSERT_EQ(guide.size(), area(48, 30));
  EXPECT_TRUE(bytes_match(codes_of_guide(guide, 48, 30), want));
  EXPECT_TRUE(std::find(want.begin(), want.end(), 157) != want.end());
}

TEST(GuidedFilter, CapAt099) {
  // 0.99 in single precision is a little more than in double precision; its lower neighbour is
  // less.
  Plane guide(9, 0.99f);
  EXPECT_GT(static_cast<double>(guide[0]), 0.99);
  EXPECT_TRUE(all_bytes_are(codes_of_guide(guide, 3, 3), 158));
  const float below = ulps_from(0.99f, -1);
  EXPECT_LT(static_cast<double>(below), 0.99);
  EXPECT_TRUE(all_bytes_are(codes_of_guide(Plane(9, below), 3, 3), reference::guided_code(below)));
  EXPECT_EQ(reference::guided_code(below), 157);
  for (const float v : {1.0f, 1.5f, 100.0f, 1.0e9f, 1.0e30f})
    EXPECT_TRUE(all_bytes_are(codes_of_guide(Plane(9, v), 3, 3), 158)) << v;
}

TEST(GuidedFilter, NothingBelow02Wraps) {
  for (const float v : {0.2f, 0.199f, 0.1f, 0.001f, 0.0f, -0.0f, -0.001f, -0.2f, -1.0f, -300.0f})
    EXPECT_TRUE(all_bytes_are(codes_of_guide(Plane(9, v), 3, 3), 0)) << v;
  const Plane low(9, -1.0e9f);
  EXPECT_TRUE(all_bytes_are(compare(low, low, 3, 3, 1), 0));
}

TEST(GuidedFilter, NeverBelowTheGuide) {
  Random random(test_seed());
  int above = 0;
  int equal = 0;
  for (int i = 0; i < 20; ++i) {
    const Plane plane = smooth_plane(random, 31, 17, 0.02f);
    const Plane guide = smooth_plane(random, 31, 17, 0.1f);
    const std::vector<uint8_t> codes = compare(plane, guide, 31, 17, 2);
    for (size_t j = 0; j < codes.size(); ++j) {
      ASSERT_GE(codes[j], reference::guided_code(guide[j]));
      (codes[j] > reference::guided_code(guide[j]) ? above : equal)++;
    }
  }
  EXPECT_GT(above, 0);
  EXPECT_GT(equal, 0);
}

TEST(GuidedFilter, EveryRadiusOnTheSmallestSizes) {
  Random random(test_seed());
  for (int radius = 1; radius <= 20; ++radius)
    for (int extra = 0; extra < 3; ++extra) {
      const int width = 2 * radius + 1 + extra;
      const int height = 2 * radius + 1 + (extra + radius) % 3;
      compare(smooth_plane(random, width, height, 0.05f),
              smooth_plane(random, width, height, 0.05f), width, height, radius);
      for (const FloatMood mood : kFloatMoods)
        compare(make_plane(random, mood, width, height),
                make_plane(random, FloatMood::kUnit, width, height), width, height, radius);
    }
}

TEST(GuidedFilter, SizesUpTo40) {
  Random random(test_seed());
  for (const int radius : {1, 2, 5})
    for (int size = 2 * radius + 1; size <= 40; ++size) {
      const int other = random.between(2 * radius + 1, 40);
      for (const float noise : {0.0f, 0.01f, 0.3f})
        compare(smooth_plane(random, size, other, noise), smooth_plane(random, size, other, noise),
                size, other, radius);
    }
}

TEST(GuidedFilter, SmallNumbersWhereEpsilonRules) {
  Random random(test_seed());
  for (const float scale : {0.001f, 0.01f, 0.03f, 0.1f})
    for (int i = 0; i < 6; ++i) {
      Plane plane = make_plane(random, FloatMood::kUnit, 26, 21);
      Plane guide = make_plane(random, FloatMood::kUnit, 26, 21);
      for (size_t j = 0; j < plane.size(); ++j) {
        guide[j] = 0.5f + scale * guide[j];
        plane[j] = 0.5f + scale * plane[j];
      }
      compare(plane, guide, 26, 21, random.between(1, 8));
    }
}

// Planes of large numbers whose terms cancel, so that the last bit of a slope decides on codes.
TEST(GuidedFilter, CancellingPlanes) {
  Random random(test_seed());
  int between = 0;
  for (int i = 0; i < 40; ++i) {
    const int radius = random.between(1, 3);
    Plane plane;
    Plane guide;
    for (int j = 0; j < 40 * 30; ++j) {
      const float size = float_between(random, 950.0f, 1050.0f);
      plane.push_back(random.between(0, 1) == 0 ? size : -size);
      guide.push_back(float_between(random, -1001.0f, -999.0f));
    }
    for (const uint8_t code : compare(plane, guide, 40, 30, radius))
      between += code > 0 && code < 158;
  }
  EXPECT_GT(between, 10);
}

TEST(GuidedFilter, FrameSizes) {
  Random random(test_seed());
  compare(smooth_plane(random, 640, 360, 0.03f), smooth_plane(random, 640, 360, 0.03f), 640, 360,
          8);
  compare(smooth_plane(random, 1280, 720, 0.03f), smooth_plane(random, 1280, 720, 0.1f), 1280, 720,
          20);
  compare(smooth_plane(random, 3, 500, 0.03f), smooth_plane(random, 3, 500, 0.03f), 3, 500, 1);
}

TEST(GuidedFilter, SamePlaneForBoth) {
  Random random(test_seed());
  Plane plane = smooth_plane(random, 40, 30, 0.1f);
  std::vector<uint8_t> codes(plane.size(), kUnwritten);
  GuidedFilterPreview(plane.data(), plane.data(), codes.data(), 40, 30, 4);
  EXPECT_TRUE(bytes_match(codes, reference::guided_filter(plane.data(), plane.data(), 40, 30, 4)));
}

TEST(GuidedFilter, CallsDoNotRememberTheLast) {
  Random random(test_seed());
  const Plane plane = smooth_plane(random, 20, 20, 0.1f);
  const Plane guide = smooth_plane(random, 20, 20, 0.1f);
  const std::vector<uint8_t> first = compare(plane, guide, 20, 20, 2);
  compare(smooth_plane(random, 50, 40, 0.1f), smooth_plane(random, 50, 40, 0.1f), 50, 40, 3);
  EXPECT_TRUE(bytes_match(compare(plane, guide, 20, 20, 2), first));
}

// Not a number gives code 0; a filtered value that is not a number leaves the guide in place.
TEST(GuidedFilter, InfiniteAndNotANumber) {
  Random random(test_seed());
  for (const float odd : {kInfinity, -kInfinity, std::numeric_limits<float>::quiet_NaN()})
    for (int i = 0; i < 6; ++i) {
      Plane plane = smooth_plane(random, 21, 18, 0.1f);
      const Plane guide = smooth_plane(random, 21, 18, 0.1f);
      plane[static_cast<size_t>(random.between(0, 21 * 18 - 1))] = odd;
      compare(plane, guide, 21, 18, 2);
      compare(guide, plane, 21, 18, 2);
    }
}

TEST(GuidedFilter, OtherSizesAndRadiiWriteNothing) {
  struct Case {
    int width, height, radius;
  };
  const Case cases[] = {{9, 9, 0},  {9, 9, -1},  {9, 9, 5},       {2, 9, 1},       {9, 2, 1},
                        {0, 9, 1},  {9, 0, 1},   {0, 0, 0},       {1, 1, 0},       {-9, 9, 1},
                        {9, -9, 1}, {-9, -9, 1}, {9, 9, INT_MAX}, {9, 9, 1 << 30}, {9, 9, INT_MIN}};
  for (const Case& c : cases) {
    Plane plane(100, 0.5f);
    GuardedBuffer<uint8_t> out(100, kUnwritten);
    GuidedFilterPreview(plane.data(), plane.data(), out.data(), c.width, c.height, c.radius);
    EXPECT_TRUE(all_bytes_are(out, kUnwritten,
                              {{"width", c.width}, {"height", c.height}, {"radius", c.radius}}));
  }
}

TEST(GuidedFilter, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int width = 5; width <= 24; ++width) {
    const Plane plane = smooth_plane(random, width, 7, 0.1f);
    const Plane guide = smooth_plane(random, width, 7, 0.1f);
    PageEndBuffer<float> p(plane);
    PageEndBuffer<float> g(guide);
    PageEndBuffer<uint8_t> out(plane.size());
    GuidedFilterPreview(p.data(), g.data(), out.data(), width, 7, 2);
    EXPECT_TRUE(
        bytes_match(out, reference::guided_filter(plane.data(), guide.data(), width, 7, 2)));
  }
}

}  // namespace
}  // namespace haze::test
