#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/float_transmission.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Plane = std::vector<float>;

constexpr uint8_t kUnwritten = 0xA5;
constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNotANumber = std::numeric_limits<float>::quiet_NaN();

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

// Lines that make a running maximum keep, replace and look for its maximum again.
enum class LineMood { kNoise, kTies, kFalling, kRising, kZeros, kTiny, kInfinities };
constexpr LineMood kLineMoods[] = {LineMood::kNoise,     LineMood::kTies,  LineMood::kFalling,
                                   LineMood::kRising,    LineMood::kZeros, LineMood::kTiny,
                                   LineMood::kInfinities};

Plane make_line(Random& random, LineMood mood, int count) {
  Plane line;
  for (int i = 0; i < count; ++i) {
    const float position = static_cast<float>(i);
    const float jitter = static_cast<float>(random.between(0, 2));
    switch (mood) {
      case LineMood::kNoise:
        line.push_back(make_float(random, FloatMood::kMixedSigns));
        break;
      case LineMood::kTies:
        line.push_back(0.25f * jitter);
        break;
      case LineMood::kFalling:
        line.push_back(100.0f - position + jitter);
        break;
      case LineMood::kRising:
        line.push_back(position + jitter);
        break;
      case LineMood::kZeros:
        line.push_back(jitter == 0.0f ? 0.0f : (jitter == 1.0f ? -0.0f : -1.0f));
        break;
      case LineMood::kTiny:  // below the normal range
        line.push_back(std::numeric_limits<float>::denorm_min() * (5.0f * jitter - 5.0f));
        break;
      case LineMood::kInfinities:
        line.push_back(jitter == 0.0f ? kInfinity : (jitter == 1.0f ? -kInfinity : position));
        break;
    }
  }
  return line;
}

// Both row forms on one line, the first with its outputs `stride` floats apart.
void compare_line(const Plane& line, int radius, int stride) {
  const int count = static_cast<int>(line.size());
  const Plane want = reference::window_maximum(line.data(), count, radius);
  GuardedBuffer<float> src(line);
  GuardedBuffer<float> dst(line.size(), kUnwritten);
  // The row count, its fourth argument, has no effect.
  getMaxChannel_horPreview(src.data(), dst.data(), count, stride * 5 - 10, radius);
  ASSERT_TRUE(planes_match(dst, want, {{"count", count}, {"radius", radius}}));
  GuardedBuffer<float> apart(line.size() * static_cast<size_t>(stride), kUnwritten);
  Plane want_apart(apart.data(), apart.data() + apart.size());
  for (size_t i = 0; i < want.size(); ++i) want_apart[i * static_cast<size_t>(stride)] = want[i];
  getMaxChannelPreview(src.data(), apart.data(), count, stride, radius);
  ASSERT_TRUE(
      planes_match(apart, want_apart, {{"count", count}, {"radius", radius}, {"row", stride}}));
  ASSERT_TRUE(planes_match(src, line));
}

void compare_columns(const Plane& map, int width, int height, int radius) {
  GuardedBuffer<float> src(map);
  GuardedBuffer<float> dst(map.size(), kUnwritten);
  getMaxChannel_verPreview(src.data(), dst.data(), width, height, radius);
  ASSERT_TRUE(
      planes_match(dst, reference::maximum_of_columns(map, width, height, radius),
                   {{"width", width}, {"height", height}, {"radius", radius}, {"row", width}}));
  ASSERT_TRUE(planes_match(src, map));
}

void expect_maxima_of_numbers(const Plane& line, const Plane& maxima, int radius) {
  const int count = static_cast<int>(line.size());
  const Plane want = reference::window_maximum(line.data(), count, radius);
  for (int i = 0; i < count; ++i) {
    const auto first = line.begin() + std::max(i - radius, 0);
    const auto last = line.begin() + std::min(i + radius + 1, count);
    if (std::any_of(first, last, [](float sample) { return std::isnan(sample); })) continue;
    const size_t output = static_cast<size_t>(i);
    EXPECT_EQ(bits_of_float(maxima[output]), bits_of_float(want[output]))
        << "count " << count << ", radius " << radius << ", output " << i;
  }
}

void expect_windows_of_numbers(const Plane& line, int radius) {
  const int count = static_cast<int>(line.size());
  Plane src = line;
  Plane dst(line.size());
  getMaxChannel_horPreview(src.data(), dst.data(), count, 1, radius);
  expect_maxima_of_numbers(line, dst, radius);
  getMaxChannelPreview(src.data(), dst.data(), count, 1, radius);
  expect_maxima_of_numbers(line, dst, radius);
}

// Each column a line of its own mood.
Plane make_columns(Random& random, int width, int height) {
  Plane map(area(width, height));
  for (int x = 0; x < width; ++x) {
    const Plane column = make_line(random, random.one_of(kLineMoods), height);
    for (int y = 0; y < height; ++y)
      map[static_cast<size_t>(y * width + x)] = column[static_cast<size_t>(y)];
  }
  return map;
}

TEST(MaxFilterRow, Radius1) {
  Plane line = {3.0f, 1.0f, -2.0f, -5.0f, -4.0f, 7.0f, 7.0f, 0.0f};
  const Plane want = {3.0f, 3.0f, 1.0f, -2.0f, 7.0f, 7.0f, 7.0f, 7.0f};
  Plane dst(line.size());
  getMaxChannel_horPreview(line.data(), dst.data(), 8, 1, 1);
  EXPECT_TRUE(planes_match(dst, want));
}

TEST(MaxFilterRow, EveryRadiusAndLength) {
  Random random(test_seed());
  for (int radius = 0; radius <= 20; ++radius)
    for (int count = 1; count <= 60; ++count)
      compare_line(make_line(random, kLineMoods[(count + radius) % 7], count), radius,
                   1 + (count + radius / 2) % 4);
}

TEST(MaxFilterRow, EveryMoodAtTheShortestLines) {
  Random random(test_seed());
  for (const LineMood mood : kLineMoods)
    for (int radius = 0; radius <= 20; ++radius)
      for (int extra = -1; extra <= 2; ++extra)
        if (2 * radius + 1 + extra > 0)
          compare_line(make_line(random, mood, 2 * radius + 1 + extra), radius, 1);
}

TEST(MaxFilterRow, LongLines) {
  Random random(test_seed());
  for (const LineMood mood : kLineMoods) {
    compare_line(make_line(random, mood, 640), 7, 1);
    compare_line(make_line(random, mood, 1280), 20, 3);
    compare_line(make_line(random, mood, 700), 250, 1);
  }
}

TEST(MaxFilterRow, WindowsWiderThanTheLine) {
  Random random(test_seed());
  for (const int radius : {30, 1000, INT_MAX / 2, INT_MAX / 2 + 1, INT_MAX - 1, INT_MAX})
    for (const int count : {1, 2, 17})
      compare_line(make_line(random, LineMood::kNoise, count), radius, 2);
}

// Samples that are not numbers spoil at most the windows that they lie in.
TEST(MaxFilterRow, NotANumberOutsideTheWindow) {
  Random random(test_seed());
  for (int radius = 0; radius <= 6; ++radius)
    for (int count = 2 * radius + 1; count <= 60; ++count) {
      Plane line = make_line(random, random.one_of(kLineMoods), count);
      for (float& sample : line)
        if (random.between(0, 3 * radius + 3) == 0) sample = kNotANumber;
      expect_windows_of_numbers(line, radius);
    }
}

TEST(MaxFilterRow, OtherLengthsAndRadiiWriteNothing) {
  Plane line(40, 1.0f);
  const int cases[][2] = {{0, 1},        {-1, 1}, {-40, 3}, {INT_MIN, 1}, {40, -1}, {40, -40},
                          {40, INT_MIN}, {0, 0},  {1, -1},  {0, -1},      {-5, -5}};
  for (const auto& c : cases) {
    GuardedBuffer<float> dst(40, kUnwritten);
    getMaxChannel_horPreview(line.data(), dst.data(), c[0], 1, c[1]);
    getMaxChannelPreview(line.data(), dst.data(), c[0], 1, c[1]);
    EXPECT_TRUE(floats_are_untouched(dst, kUnwritten, {{"count", c[0]}, {"radius", c[1]}}));
  }
}

TEST(MaxFilterRow, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int count = 1; count <= 40; ++count) {
    const Plane line = make_line(random, LineMood::kNoise, count);
    PageEndBuffer<float> src(line);
    PageEndBuffer<float> dst(line.size());
    PageEndBuffer<float> apart(line.size() * 3 - 2);
    getMaxChannel_horPreview(src.data(), dst.data(), count, 1, 4);
    getMaxChannelPreview(src.data(), apart.data(), count, 3, 4);
    EXPECT_TRUE(planes_match(dst, reference::window_maximum(line.data(), count, 4)));
    for (size_t i = 0; i < dst.size(); ++i)
      EXPECT_EQ(bits_of_float(apart.data()[3 * i]), bits_of_float(dst.data()[i]));
  }
}

TEST(MaxFilterColumns, EveryRadiusAndHeight) {
  Random random(test_seed());
  for (int radius = 0; radius <= 20; ++radius)
    for (int height = 1; height <= 50; height += 1 + height / (2 * radius + 4)) {
      const int width = random.between(1, 40);
      compare_columns(make_columns(random, width, height), width, height, radius);
    }
}

TEST(MaxFilterColumns, EveryWidthUpTo40) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width) {
    compare_columns(make_columns(random, width, 23), width, 23, 3);
    compare_columns(make_columns(random, width, 15), width, 15, 7);
  }
}

TEST(MaxFilterColumns, FrameSizes) {
  Random random(test_seed());
  compare_columns(make_plane(random, FloatMood::kUnit, 640, 360), 640, 360, 7);
  compare_columns(make_plane(random, FloatMood::kMixedSigns, 1280, 720), 1280, 720, 3);
  compare_columns(make_columns(random, 5, 1000), 5, 1000, 20);
}

TEST(MaxFilterColumns, WindowsHigherThanTheMap) {
  Random random(test_seed());
  for (const int radius : {30, 1000, INT_MAX / 2, INT_MAX / 2 + 1, INT_MAX - 1, INT_MAX})
    for (const int height : {1, 2, 9})
      compare_columns(make_columns(random, 6, height), 6, height, radius);
}

TEST(MaxFilterColumns, NotANumberOutsideTheWindow) {
  Random random(test_seed());
  for (int radius = 0; radius <= 6; ++radius) {
    Plane map = make_columns(random, 9, 40);
    for (float& sample : map)
      if (random.between(0, 3 * radius + 3) == 0) sample = kNotANumber;
    Plane dst(map.size());
    getMaxChannel_verPreview(map.data(), dst.data(), 9, 40, radius);
    for (size_t x = 0; x < 9; ++x) {
      Plane column;
      Plane maxima;
      for (size_t y = 0; y < 40; ++y) {
        column.push_back(map[y * 9 + x]);
        maxima.push_back(dst[y * 9 + x]);
      }
      expect_maxima_of_numbers(column, maxima, radius);
    }
  }
}

TEST(MaxFilterColumns, OtherSizesAndRadiiWriteNothing) {
  Plane map(400, 1.0f);
  const int cases[][3] = {{0, 9, 1},  {9, 0, 1},  {-9, 9, 1},      {9, -9, 1},      {-9, -9, 1},
                          {9, 9, -1}, {9, 9, -9}, {9, 9, INT_MIN}, {INT_MIN, 9, 1}, {9, INT_MIN, 1},
                          {0, 0, 0},  {1, 1, -1}, {-2, -2, -2}};
  for (const auto& c : cases) {
    GuardedBuffer<float> dst(400, kUnwritten);
    getMaxChannel_verPreview(map.data(), dst.data(), c[0], c[1], c[2]);
    EXPECT_TRUE(floats_are_untouched(dst, kUnwritten,
                                     {{"width", c[0]}, {"height", c[1]}, {"radius", c[2]}}));
  }
}

TEST(MaxFilterColumns, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int width = 1; width <= 24; ++width) {
    const Plane map = make_plane(random, FloatMood::kUnit, width, 11);
    PageEndBuffer<float> src(map);
    PageEndBuffer<float> dst(map.size());
    getMaxChannel_verPreview(src.data(), dst.data(), width, 11, 4);
    EXPECT_TRUE(planes_match(dst, reference::maximum_of_columns(map, width, 11, 4)));
  }
}

}  // namespace
}  // namespace haze::test
