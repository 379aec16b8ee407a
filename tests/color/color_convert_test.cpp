// Conversions at full resolution and the split of four interleaved components.
#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <functional>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/color_convert.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Pixel = std::array<int, 3>;
using Convert = void (*)(unsigned char*, unsigned char*, int, int);
using Define = void (*)(const uint8_t*, uint8_t*, int, int);

size_t bytes_of(int width, int height, int bytes_per_pixel) {
  return static_cast<size_t>(width * height * bytes_per_pixel);
}

struct Conversion {
  const char* name;
  Convert convert;
  Define define;
  int bytes_in;
  int bytes_out;
};

const Conversion kConversions[] = {
    {"BGR2YCrCbPreview", BGR2YCrCbPreview, reference::bgr_to_ycrcb, 3, 3},
    {"YCrCb2BGRPreview", YCrCb2BGRPreview, reference::ycrcb_to_bgr, 3, 3},
    {"xBGR2YCrCbPreview", xBGR2YCrCbPreview, reference::bgr_to_two_bytes, 3, 2},
    {"split_4componentPreview", split_4componentPreview, reference::split_components, 4, 4},
};

void compare(const Conversion& conversion, Random& random, Mood mood, int width, int height,
             size_t skew = 0) {
  SCOPED_TRACE(conversion.name);
  const std::vector<uint8_t> content =
      make_image(random, mood, width * conversion.bytes_in, height);
  GuardedBuffer<uint8_t> source(content, skew);
  GuardedBuffer<uint8_t> actual(bytes_of(width, height, conversion.bytes_out), 0xA5, skew);
  std::vector<uint8_t> want(actual.size(), 0x5A);
  conversion.convert(source.data(), actual.data(), width, height);
  conversion.define(content.data(), want.data(), width, height);
  EXPECT_TRUE(bytes_match(
      actual, want, {{"width", width}, {"height", height}, {"row", width * conversion.bytes_out}}));
  EXPECT_TRUE(bytes_match(source, content));
}

// One pixel, and the same pixel throughout an image with whole vector steps and a tail.
Pixel convert_pixel(Convert convert, const Pixel& pixel) {
  constexpr int kWidth = 37;
  std::vector<uint8_t> source;
  for (int i = 0; i < kWidth; ++i)
    for (const int byte : pixel) source.push_back(static_cast<uint8_t>(byte));
  std::vector<uint8_t> row(source.size());
  convert(source.data(), row.data(), kWidth, 1);
  std::vector<uint8_t> alone(3);
  convert(source.data(), alone.data(), 1, 1);
  for (size_t i = 0; i < row.size(); ++i) EXPECT_EQ(row[i], alone[i % 3]) << "byte " << i;
  return {alone[0], alone[1], alone[2]};
}

// All 2^24 pixels, 256 x 256 of them per call: the first byte by call, the others by row and
// column.
void expect_every_pixel(Convert convert, const std::function<void(int, uint8_t*)>& define_slab) {
  constexpr int kSide = 256;
  std::vector<uint8_t> source(bytes_of(kSide, kSide, 3));
  std::vector<uint8_t> actual(source.size());
  std::vector<uint8_t> want(source.size());
  for (size_t i = 0; i < 65536; ++i) {
    source[3 * i + 1] = static_cast<uint8_t>(i / 256);
    source[3 * i + 2] = static_cast<uint8_t>(i % 256);
  }
  for (int first = 0; first < 256; ++first) {
    for (size_t i = 0; i < 65536; ++i) source[3 * i] = static_cast<uint8_t>(first);
    define_slab(first, want.data());
    for (size_t i = 0; i < want.size(); ++i) actual[i] = static_cast<uint8_t>(~want[i]);
    convert(source.data(), actual.data(), kSide, kSide);
    ASSERT_TRUE(bytes_match(actual, want, {{"first byte", first}, {"row", kSide * 3}}));
  }
}

TEST(BgrToYCrCb, EveryColour) {
  int wrapped = 0;
  expect_every_pixel(BGR2YCrCbPreview, [&](int b, uint8_t* want) {
    for (int g = 0; g < 256; ++g)
      for (int r = 0; r < 256; ++r) {
        const reference::YCrCb pixel = reference::ycrcb_of_bgr(b, g, r);
        wrapped += pixel.cr == 256;
        *want++ = static_cast<uint8_t>(pixel.y);
        *want++ = static_cast<uint8_t>(pixel.cr);
        *want++ = static_cast<uint8_t>(pixel.cb);
      }
  });
  // Full red without green and with at most 2 of blue.
  EXPECT_EQ(wrapped, 3);
}

TEST(BgrToYCrCb, PrimariesWhiteAndBlack) {
  EXPECT_EQ(convert_pixel(BGR2YCrCbPreview, {255, 0, 0}), (Pixel{29, 107, 255}));
  EXPECT_EQ(convert_pixel(BGR2YCrCbPreview, {0, 255, 0}), (Pixel{150, 21, 43}));
  EXPECT_EQ(convert_pixel(BGR2YCrCbPreview, {255, 255, 255}), (Pixel{255, 128, 128}));
  EXPECT_EQ(convert_pixel(BGR2YCrCbPreview, {0, 0, 0}), (Pixel{0, 128, 128}));
}

TEST(BgrToYCrCb, CrOfPureRedWrapsToZero) {
  EXPECT_EQ(convert_pixel(BGR2YCrCbPreview, {0, 0, 255}), (Pixel{76, 0, 85}));
}

TEST(YCrCbToBgr, EveryColour) {
  expect_every_pixel(YCrCb2BGRPreview, [](int y, uint8_t* want) {
    for (int cr = 0; cr < 256; ++cr)
      for (int cb = 0; cb < 256; ++cb) {
        const reference::Bgr pixel = reference::bgr_of_ycrcb(y, cr, cb);
        *want++ = pixel.b;
        *want++ = pixel.g;
        *want++ = pixel.r;
      }
  });
}

TEST(YCrCbToBgr, ClampsAtBothEnds) {
  EXPECT_EQ(convert_pixel(YCrCb2BGRPreview, {255, 255, 255}), (Pixel{255, 121, 255}));
  EXPECT_EQ(convert_pixel(YCrCb2BGRPreview, {128, 0, 0}), (Pixel{0, 255, 0}));
  for (const int y : {0, 1, 127, 254, 255})
    EXPECT_EQ(convert_pixel(YCrCb2BGRPreview, {y, 128, 128}), (Pixel{y, y, y}));
}

// The corner pixel of every block takes all colours on a grid that holds the extremes.
TEST(BgrToTwoBytes, EveryCornerColourOnAGrid) {
  constexpr int kSteps = 64;
  const auto level = [](int step) { return static_cast<uint8_t>(step * 255 / (kSteps - 1)); };
  constexpr int kSide = 2 * kSteps;
  Random random(test_seed());
  std::vector<uint8_t> bgr = make_image(random, Mood::kNoise, 3 * kSide, kSide);
  std::vector<uint8_t> actual(bytes_of(kSide, kSide, 2));
  std::vector<uint8_t> want(actual.size());
  for (int b = 0; b < kSteps; ++b) {
    for (int g = 0; g < kSteps; ++g)
      for (int r = 0; r < kSteps; ++r) {
        uint8_t* corner = bgr.data() + 3 * (2 * g * kSide + 2 * r);
        corner[0] = level(b);
        corner[1] = level(g);
        corner[2] = level(r);
      }
    reference::bgr_to_two_bytes(bgr.data(), want.data(), kSide, kSide);
    for (size_t i = 0; i < want.size(); ++i) actual[i] = static_cast<uint8_t>(~want[i]);
    xBGR2YCrCbPreview(bgr.data(), actual.data(), kSide, kSide);
    ASSERT_TRUE(bytes_match(actual, want, {{"blue", level(b)}, {"row", 2 * kSide}}));
  }
}

TEST(BgrToTwoBytes, CrOfPureRedIsClamped) {
  // Red, black / white, blue.
  std::vector<uint8_t> bgr = {0, 0, 255, 0, 0, 0, 255, 255, 255, 255, 0, 0};
  std::vector<uint8_t> yc(8);
  xBGR2YCrCbPreview(bgr.data(), yc.data(), 2, 2);
  EXPECT_EQ(yc, (std::vector<uint8_t>{76, 85, 0, 255, 255, 85, 29, 255}));
}

TEST(BgrToTwoBytes, OnlyTheCornerDecidesChroma) {
  constexpr int kWidth = 26;
  constexpr int kHeight = 6;
  Random random(test_seed());
  std::vector<uint8_t> bgr = make_image(random, Mood::kNoise, 3 * kWidth, kHeight);
  std::vector<uint8_t> before(bytes_of(kWidth, kHeight, 2));
  xBGR2YCrCbPreview(bgr.data(), before.data(), kWidth, kHeight);
  for (int y = 0; y < kHeight; ++y)
    for (int x = 0; x < kWidth; ++x)
      if (x % 2 == 1 || y % 2 == 1)
        for (int c = 0; c < 3; ++c)
          bgr[static_cast<size_t>(3 * (y * kWidth + x) + c)] = random.byte();
  std::vector<uint8_t> after(before.size());
  xBGR2YCrCbPreview(bgr.data(), after.data(), kWidth, kHeight);
  for (size_t i = 1; i < after.size(); i += 2) EXPECT_EQ(after[i], before[i]) << "byte " << i;
}

TEST(SplitComponents, TwoByOne) {
  std::vector<uint8_t> src = {1, 2, 3, 4, 5, 6, 7, 8};
  std::vector<uint8_t> planes(8);
  split_4componentPreview(src.data(), planes.data(), 2, 1);
  EXPECT_EQ(planes, (std::vector<uint8_t>{1, 5, 2, 6, 3, 7, 4, 8}));
}

// Every width from 1 to 40 has even and odd heights.
TEST(ColourConversions, EveryTailLength) {
  Random random(test_seed());
  for (const Conversion& conversion : kConversions)
    for (int width = 1; width <= 40; ++width)
      for (const Mood mood : kMoods) compare(conversion, random, mood, width, random.between(1, 7));
}

// Up to three of the widest vector steps, row by row.
TEST(ColourConversions, WidthsUpTo200) {
  Random random(test_seed());
  for (const Conversion& conversion : kConversions)
    for (int width = 41; width <= 200; ++width)
      compare(conversion, random, random.one_of(kMoods), width, random.between(1, 3));
}

TEST(ColourConversions, EveryHeight) {
  Random random(test_seed());
  for (const Conversion& conversion : kConversions)
    for (int height = 1; height <= 40; ++height)
      compare(conversion, random, random.one_of(kMoods), random.between(1, 40), height);
}

TEST(ColourConversions, UnalignedStarts) {
  Random random(test_seed());
  for (const Conversion& conversion : kConversions)
    for (size_t skew = 1; skew < 16; ++skew)
      compare(conversion, random, Mood::kNoise, random.between(1, 70), 4, skew);
}

TEST(ColourConversions, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {641, 359}};
  for (const Conversion& conversion : kConversions)
    for (const auto& size : sizes) compare(conversion, random, Mood::kNoise, size[0], size[1]);
}

TEST(ColourConversions, TouchNothingPastTheEnd) {
  Random random(test_seed());
  for (const Conversion& conversion : kConversions) {
    SCOPED_TRACE(conversion.name);
    for (int width = 1; width <= 140; ++width) {
      const int height = random.between(1, 4);
      PageEndBuffer<uint8_t> source(
          make_image(random, Mood::kNoise, width * conversion.bytes_in, height));
      PageEndBuffer<uint8_t> actual(bytes_of(width, height, conversion.bytes_out));
      std::vector<uint8_t> want(actual.size());
      conversion.convert(source.data(), actual.data(), width, height);
      conversion.define(source.data(), want.data(), width, height);
      EXPECT_TRUE(bytes_match(actual, want, {{"width", width}, {"height", height}}));
    }
  }
}

TEST(ColourConversions, EmptySizesWriteNothing) {
  const int sizes[][2] = {{0, 0},       {0, 4},  {4, 0},  {-2, 4},  {4, -2},
                          {-4, -4},     {-1, 1}, {1, -1}, {-3, -3}, {INT_MIN, 2},
                          {2, INT_MIN}, {-8, 0}, {0, -8}, {-1, -1}};
  std::vector<uint8_t> source(1024, 200);
  for (const Conversion& conversion : kConversions)
    for (const auto& size : sizes) {
      GuardedBuffer<uint8_t> actual(1024, 0xA5);
      conversion.convert(source.data() + 512, actual.data() + 512, size[0], size[1]);
      EXPECT_TRUE(all_bytes_are(actual, 0xA5, {{"width", size[0]}, {"height", size[1]}}))
          << conversion.name;
    }
}

}  // namespace
}  // namespace haze::test
