#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/brightness.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;

Frame lift(const Frame& frame) {
  Frame want = frame;
  for (size_t i = 0; i < want.size(); i += 2) want[i] = reference::lifted_byte(want[i]);
  return want;
}

void compare(const Frame& frame, int width, int height) {
  GuardedBuffer<uint8_t> actual(frame);
  ImproveBrightnessPreview(actual.data(), width, height);
  ASSERT_TRUE(
      bytes_match(actual, lift(frame), {{"width", width}, {"height", height}, {"row", 2 * width}}));
}

uint8_t lifted(uint8_t value) {
  uint8_t pixel[2] = {value, 0};
  ImproveBrightnessPreview(pixel, 1, 1);
  return pixel[0];
}

// No value lies so near to a whole number that the last bits of a logarithm could decide.
TEST(BrightnessReference, NoValueNearAWholeNumber) {
  for (int v = 1; v < 256; ++v) {
    const double x = reference::lifted(static_cast<uint8_t>(v));
    EXPECT_GT(std::fabs(x - std::round(x)), 1.0e-9) << v;
  }
}

TEST(Brightness, SampleValues) {
  const int samples[][2] = {{0, 0}, {1, 0}, {2, 1}, {100, 114}, {128, 141}, {200, 204}, {255, 250}};
  for (const auto& sample : samples)
    EXPECT_EQ(lifted(static_cast<uint8_t>(sample[0])), sample[1]) << sample[0];
}

TEST(Brightness, EveryByte) {
  Frame frame;
  for (int v = 0; v < 256; ++v) {
    frame.push_back(static_cast<uint8_t>(v));
    frame.push_back(static_cast<uint8_t>(v * 7 + 3));
  }
  compare(frame, 256, 1);
  compare(frame, 1, 256);
  compare(frame, 16, 16);
  for (int v = 0; v < 256; ++v) {
    const uint8_t byte = static_cast<uint8_t>(v);
    EXPECT_EQ(lifted(byte), reference::lifted_byte(byte)) << v;
    EXPECT_GE(lifted(byte), lifted(static_cast<uint8_t>(v == 0 ? 0 : v - 1))) << v;
  }
}

TEST(Brightness, SecondBytesOfPixelsStay) {
  Frame frame(2 * 40 * 30);
  for (size_t i = 0; i < frame.size(); ++i) frame[i] = static_cast<uint8_t>(i / 2);
  const Frame before = frame;
  ImproveBrightnessPreview(frame.data(), 40, 30);
  for (size_t i = 1; i < frame.size(); i += 2) ASSERT_EQ(frame[i], before[i]) << i;
}

TEST(Brightness, SizesUpTo40) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width)
    for (int i = 0; i < 4; ++i) {
      const int height = random.between(1, 40);
      compare(make_image(random, random.one_of(kMoods), 2 * width, height), width, height);
    }
}

TEST(Brightness, FrameSizes) {
  Random random(test_seed());
  compare(make_image(random, Mood::kNoise, 2 * 640, 360), 640, 360);
  compare(make_image(random, Mood::kNoise, 2 * 1280, 720), 1280, 720);
}

// The lift is not idempotent, and a call knows nothing of the one before.
TEST(Brightness, TwiceLiftsTwice) {
  Random random(test_seed());
  const Frame once = lift(make_image(random, Mood::kNoise, 40, 20));
  compare(once, 20, 20);
  compare(lift(once), 20, 20);
}

TEST(Brightness, EmptySizesWriteNothing) {
  const int sizes[][2] = {{0, 0},   {0, 2},       {2, 0},       {-2, 2},  {2, -2}, {-2, -2},
                          {-8, -8}, {INT_MIN, 2}, {2, INT_MIN}, {-16, 4}, {4, -16}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> frame(600, 60);
    ImproveBrightnessPreview(frame.data() + 300, size[0], size[1]);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(Brightness, TouchesNothingPastTheFrame) {
  Random random(test_seed());
  for (int width = 1; width <= 24; ++width) {
    const Frame content = make_image(random, Mood::kNoise, 2 * width, 3);
    PageEndBuffer<uint8_t> frame(content);
    ImproveBrightnessPreview(frame.data(), width, 3);
    EXPECT_TRUE(bytes_match(frame, lift(content), {{"width", width}}));
  }
}

}  // namespace
}  // namespace haze::test
