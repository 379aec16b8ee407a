// The light of a dark-channel histogram.
#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/atmospheric_light.h"
#include "tests/reference/min_filter.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Light = std::array<uint8_t, 3>;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

Light estimate(const std::vector<uint8_t>& dark, const std::vector<uint8_t>& image,
               const std::vector<int>& bins, int width, int height) {
  GuardedBuffer<uint8_t> dark_map(dark);
  GuardedBuffer<uint8_t> colours(image);
  GuardedBuffer<int> histogram(bins);
  GuardedBuffer<uint8_t> light(3, 0xA5);
  EstimateAPreview(dark_map.data(), colours.data(), histogram.data(), light.data(), width, height);
  EXPECT_TRUE(bytes_match(dark_map, dark));
  EXPECT_TRUE(bytes_match(colours, image));
  EXPECT_EQ(std::vector<int>(histogram.data(), histogram.data() + 256), bins);
  return {light[0], light[1], light[2]};
}

void compare_light(const std::vector<uint8_t>& dark, const std::vector<uint8_t>& image,
                   const std::vector<int>& bins, int width, int height) {
  EXPECT_EQ(estimate(dark, image, bins, width, height),
            reference::estimate_light(dark.data(), image.data(), bins.data(), width, height))
      << width << " x " << height << ", seed " << test_seed();
}

// An image of `pixels` pixels whose dark channel holds the given bins and 0 elsewhere. All pixels
// of a bin have the colour (bin, 255 - bin, 7), so that the light tells the bin.
struct BinnedImage {
  BinnedImage(int width, int height, const std::vector<std::array<int, 2>>& counts)
      : dark(area(width, height)), image(3 * dark.size()), bins(256) {
    size_t next = 0;
    for (const auto& [bin, count] : counts)
      for (int i = 0; i < count; ++i) dark[next++] = static_cast<uint8_t>(bin);
    for (size_t i = 0; i < dark.size(); ++i) {
      image[3 * i] = dark[i];
      image[3 * i + 1] = static_cast<uint8_t>(255 - dark[i]);
      image[3 * i + 2] = 7;
      ++bins[dark[i]];
    }
  }

  std::vector<uint8_t> dark;
  std::vector<uint8_t> image;
  std::vector<int> bins;
};

int chosen_bin(int width, int height, const std::vector<std::array<int, 2>>& counts) {
  const BinnedImage binned(width, height, counts);
  const Light light = estimate(binned.dark, binned.image, binned.bins, width, height);
  EXPECT_EQ(light[1], 255 - light[0]);
  EXPECT_EQ(light[2], 7);
  EXPECT_EQ(light[0], reference::brightest_populated_bin(binned.bins.data(), width * height));
  return light[0];
}

TEST(AtmosphericLight, BrightestBinAloneHoldsEnough) {
  // 307 pixels are looked for.
  EXPECT_EQ(chosen_bin(640, 480, {{255, 307}, {254, 5000}}), 255);
  EXPECT_EQ(chosen_bin(640, 480, {{255, 306}, {254, 5000}}), 254);
  EXPECT_EQ(chosen_bin(640, 480, {{255, 5000}, {254, 9000}}), 255);
}

TEST(AtmosphericLight, MeanColourOfTheBrightestBin) {
  const std::vector<uint8_t> dark = {255, 3, 255, 255};
  const std::vector<uint8_t> image = {255, 10, 0, 9, 9, 9, 255, 11, 1, 254, 11, 1};
  std::vector<int> bins(256);
  bins[255] = 3;
  bins[3] = 1;
  // 764 / 3, 32 / 3 and 2 / 3, truncated.
  EXPECT_EQ(estimate(dark, image, bins, 2, 2), (Light{254, 10, 0}));
}

TEST(AtmosphericLight, MostPopulatedBinOfTheRange) {
  EXPECT_EQ(chosen_bin(640, 480, {{254, 10}, {253, 200}, {252, 50}, {251, 40}, {250, 300}}), 250);
}

TEST(AtmosphericLight, BrighterBinWinsATie) {
  EXPECT_EQ(chosen_bin(640, 480, {{254, 10}, {253, 200}, {252, 50}, {251, 40}, {250, 200}}), 253);
}

// The bin that completes the range still belongs to it, the one after it no more.
TEST(AtmosphericLight, RangeEndsWhereItHoldsEnough) {
  EXPECT_EQ(chosen_bin(640, 480, {{200, 306}, {150, 307}, {140, 900}}), 150);
  EXPECT_EQ(chosen_bin(640, 480, {{200, 307}, {150, 308}}), 200);
  EXPECT_EQ(chosen_bin(640, 480, {{200, 300}, {150, 7}, {140, 900}}), 200);
}

// 0.1 % of the pixels is truncated: 1 of 1999, 2 of 2000.
TEST(AtmosphericLight, ThousandthIsTruncated) {
  EXPECT_EQ(chosen_bin(1999, 1, {{255, 1}, {254, 2}}), 255);
  EXPECT_EQ(chosen_bin(2000, 1, {{255, 1}, {254, 2}}), 254);
  EXPECT_EQ(chosen_bin(1, 1000, {{9, 1}, {8, 2}}), 9);
  EXPECT_EQ(chosen_bin(40, 50, {{9, 1}, {8, 2}}), 8);
  EXPECT_EQ(chosen_bin(100, 30, {{9, 1}, {8, 1}, {7, 2}}), 7);
  EXPECT_EQ(chosen_bin(2999, 1, {{9, 1}, {8, 1}, {7, 2}}), 9);
}

// Nothing but bin 0 is left when the walk gets there.
TEST(AtmosphericLight, BlackImage) { EXPECT_EQ(chosen_bin(50, 40, {}), 0); }

TEST(AtmosphericLight, NoPixelInTheBin) {
  std::vector<int> bins(256);
  bins[100] = 999;
  // Of fewer than 1000 pixels none is looked for, which bin 255 has.
  EXPECT_EQ(estimate(std::vector<uint8_t>(999, 100), std::vector<uint8_t>(2997, 50), bins, 27, 37),
            (Light{255, 255, 255}));
  // A histogram of another map.
  EXPECT_EQ(estimate(std::vector<uint8_t>(2000, 90), std::vector<uint8_t>(6000, 50), bins, 40, 50),
            (Light{255, 255, 255}));
}

// Fewer entries than pixels: the walk stops at bin 0 at the latest.
TEST(AtmosphericLight, HistogramThatDoesNotReachAThousandth) {
  std::vector<uint8_t> dark(area(100, 100), 40);
  dark[17] = 255;
  std::vector<uint8_t> image(3 * dark.size(), 60);
  image[51] = 1;
  image[52] = 2;
  image[53] = 3;
  std::vector<int> bins(256);
  EXPECT_EQ(estimate(dark, image, bins, 100, 100), (Light{1, 2, 3}));
  bins[40] = 2;
  bins[0] = 1;
  EXPECT_EQ(estimate(dark, image, bins, 100, 100), (Light{60, 60, 60}));
  bins[0] = 3;
  EXPECT_EQ(estimate(dark, image, bins, 100, 100), (Light{255, 255, 255}));
}

TEST(AtmosphericLight, DarkChannelsOfImages) {
  Random random(test_seed());
  for (const Mood mood : kMoods)
    for (int i = 0; i < 12; ++i) {
      const int width = random.between(1, 120);
      const int height = random.between(1, 120);
      const std::vector<uint8_t> image = make_image(random, mood, 3 * width, height);
      const std::vector<uint8_t> map = make_image(random, mood, width, height);
      const std::vector<uint8_t> dark =
          reference::square_minimum(map.data(), width, height, random.between(0, 2));
      compare_light(dark, image, reference::histogram_of(dark.data(), width * height), width,
                    height);
    }
}

TEST(AtmosphericLight, AnyHistogram) {
  Random random(test_seed());
  for (int i = 0; i < 200; ++i) {
    const int width = random.between(30, 100);
    const int height = random.between(30, 100);
    std::vector<int> bins(256);
    for (int& bin : bins) bin = random.between(0, 3);
    compare_light(make_image(random, Mood::kNoise, width, height),
                  make_image(random, Mood::kNoise, 3 * width, height), bins, width, height);
  }
}

TEST(AtmosphericLight, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}};
  for (const auto& [width, height] : sizes) {
    const std::vector<uint8_t> dark = make_image(random, Mood::kSparks, width, height);
    compare_light(dark, make_image(random, Mood::kNearMaximum, 3 * width, height),
                  reference::histogram_of(dark.data(), width * height), width, height);
  }
}

TEST(AtmosphericLight, EmptySizesWriteNothing) {
  std::vector<uint8_t> bytes(1024, 200);
  std::vector<int> bins(256, 1);
  const int sizes[][2] = {{0, 0},   {0, 8},   {8, 0},       {-8, 8},     {8, -8},
                          {-8, -8}, {-1, -1}, {INT_MIN, 8}, {8, INT_MIN}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> light(3, 0xA5);
    EstimateAPreview(bytes.data() + 512, bytes.data() + 512, bins.data(), light.data(), size[0],
                     size[1]);
    EXPECT_TRUE(all_bytes_are(light, 0xA5, {{"width", size[0]}, {"height", size[1]}}));
  }
}

}  // namespace
}  // namespace haze::test
