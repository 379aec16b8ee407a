// CIE L*a*b*, CIEDE2000 and the picture measures built on them.
#include "color_difference.h"

#include <gtest/gtest.h>

#include "picture_metrics.h"

namespace dehaze {
namespace {

struct PublishedPair {
  Lab first;
  Lab second;
  double difference;
};

// Table 1 of "The CIEDE2000 Color-Difference Formula: Implementation Notes, Supplementary Test
// Data, and Mathematical Observations" (Sharma, Wu, Dalal 2005). clang-format off
const PublishedPair kPublished[] = {
    {{50.0000, 2.6772, -79.7751}, {50.0000, 0.0000, -82.7485}, 2.0425},
    {{50.0000, 3.1571, -77.2803}, {50.0000, 0.0000, -82.7485}, 2.8615},
    {{50.0000, 2.8361, -74.0200}, {50.0000, 0.0000, -82.7485}, 3.4412},
    {{50.0000, -1.3802, -84.2814}, {50.0000, 0.0000, -82.7485}, 1.0000},
    {{50.0000, -1.1848, -84.8006}, {50.0000, 0.0000, -82.7485}, 1.0000},
    {{50.0000, -0.9009, -85.5211}, {50.0000, 0.0000, -82.7485}, 1.0000},
    {{50.0000, 0.0000, 0.0000}, {50.0000, -1.0000, 2.0000}, 2.3669},
    {{50.0000, -1.0000, 2.0000}, {50.0000, 0.0000, 0.0000}, 2.3669},
    {{50.0000, 2.4900, -0.0010}, {50.0000, -2.4900, 0.0009}, 7.1792},
    {{50.0000, 2.4900, -0.0010}, {50.0000, -2.4900, 0.0010}, 7.1792},
    {{50.0000, 2.4900, -0.0010}, {50.0000, -2.4900, 0.0011}, 7.2195},
    {{50.0000, 2.4900, -0.0010}, {50.0000, -2.4900, 0.0012}, 7.2195},
    {{50.0000, -0.0010, 2.4900}, {50.0000, 0.0009, -2.4900}, 4.8045},
    {{50.0000, -0.0010, 2.4900}, {50.0000, 0.0010, -2.4900}, 4.8045},
    {{50.0000, -0.0010, 2.4900}, {50.0000, 0.0011, -2.4900}, 4.7461},
    {{50.0000, 2.5000, 0.0000}, {50.0000, 0.0000, -2.5000}, 4.3065},
    {{50.0000, 2.5000, 0.0000}, {73.0000, 25.0000, -18.0000}, 27.1492},
    {{50.0000, 2.5000, 0.0000}, {61.0000, -5.0000, 29.0000}, 22.8977},
    {{50.0000, 2.5000, 0.0000}, {56.0000, -27.0000, -3.0000}, 31.9030},
    {{50.0000, 2.5000, 0.0000}, {58.0000, 24.0000, 15.0000}, 19.4535},
    {{50.0000, 2.5000, 0.0000}, {50.0000, 3.1736, 0.5854}, 1.0000},
    {{50.0000, 2.5000, 0.0000}, {50.0000, 3.2972, 0.0000}, 1.0000},
    {{50.0000, 2.5000, 0.0000}, {50.0000, 1.8634, 0.5757}, 1.0000},
    {{50.0000, 2.5000, 0.0000}, {50.0000, 3.2592, 0.3350}, 1.0000},
    {{60.2574, -34.0099, 36.2677}, {60.4626, -34.1751, 39.4387}, 1.2644},
    {{63.0109, -31.0961, -5.8663}, {62.8187, -29.7946, -4.0864}, 1.2630},
    {{61.2901, 3.7196, -5.3901}, {61.4292, 2.2480, -4.9620}, 1.8731},
    {{35.0831, -44.1164, 3.7933}, {35.0232, -40.0716, 1.5901}, 1.8645},
    {{22.7233, 20.0904, -46.6940}, {23.0331, 14.9730, -42.5619}, 2.0373},
    {{36.4612, 47.8580, 18.3852}, {36.2715, 50.5065, 21.2231}, 1.4146},
    {{90.8027, -2.0831, 1.4410}, {91.1528, -1.6435, 0.0447}, 1.4441},
    {{90.9257, -0.5406, -0.9208}, {88.6381, -0.8985, -0.7239}, 1.5381},
    {{6.7747, -0.2908, -2.4247}, {5.8714, -0.0985, -2.2286}, 0.6377},
    {{2.0776, 0.0795, -1.1350}, {0.9033, -0.0636, -0.5514}, 0.9082},
};
// clang-format on

TEST(ColorDifference, PublishedPairs) {
  for (const PublishedPair& pair : kPublished) {
    EXPECT_NEAR(ciede2000(pair.first, pair.second), pair.difference, 0.00005);
    EXPECT_NEAR(ciede2000(pair.second, pair.first), pair.difference, 0.00005);
  }
}

TEST(ColorDifference, LabOfPrimaries) {
  // White, black, and red as tables of sRGB in L*a*b* give it.
  const uint8_t white[] = {255, 255, 255};
  const uint8_t black[] = {0, 0, 0};
  const uint8_t red[] = {255, 0, 0};
  EXPECT_NEAR(lab_of_srgb(white).l, 100, 0.001);
  EXPECT_NEAR(chroma(lab_of_srgb(white)), 0, 0.01);
  EXPECT_NEAR(lab_of_srgb(black).l, 0, 0.001);
  EXPECT_NEAR(lab_of_srgb(red).l, 53.24, 0.01);
  EXPECT_NEAR(lab_of_srgb(red).a, 80.09, 0.01);
  EXPECT_NEAR(lab_of_srgb(red).b, 67.20, 0.01);
}

TEST(ColorDifference, HueAngles) {
  EXPECT_DOUBLE_EQ(hue_difference({50, 10, 0}, {80, 0, 3}), 90);
  EXPECT_DOUBLE_EQ(hue_difference({50, 10, 0}, {50, -1, 0}), 180);
  // Across the positive axis the short way is taken.
  EXPECT_NEAR(hue_difference({50, 1, 1}, {50, 1, -1}), 90, 1e-9);
  EXPECT_DOUBLE_EQ(hue_difference({50, 0, 0}, {50, 5, 5}), 0);
}

RgbPicture picture_of(std::vector<uint8_t> bytes) {
  return {static_cast<int>(bytes.size() / 3), 1, std::move(bytes)};
}

TEST(PictureMetrics, ClippedShare) {
  EXPECT_DOUBLE_EQ(clipped_share(picture_of({1, 2, 3, 0, 9, 9, 254, 254, 254, 7, 255, 7})), 0.5);
}

TEST(PictureMetrics, HueShiftCountsColoursOnly) {
  const RgbPicture reference = picture_of({200, 40, 40, 90, 90, 90});
  EXPECT_NEAR(mean_hue_shift(reference, reference), 0, 1e-9);
  // The grey pixel may become anything; the red one keeps its hue.
  EXPECT_NEAR(mean_hue_shift(reference, picture_of({200, 40, 40, 90, 190, 90})), 0, 0.1);
  const uint8_t red[] = {200, 40, 40};
  const uint8_t green[] = {40, 200, 40};
  EXPECT_NEAR(mean_hue_shift(reference, picture_of({40, 200, 40, 90, 90, 90})),
              hue_difference(lab_of_srgb(red), lab_of_srgb(green)), 0.1);
}

TEST(PictureMetrics, MeanColorDifference) {
  const uint8_t red[] = {200, 40, 40};
  const uint8_t grey[] = {90, 90, 90};
  const double difference = ciede2000(lab_of_srgb(red), lab_of_srgb(grey));
  EXPECT_NEAR(
      mean_ciede2000(picture_of({200, 40, 40, 90, 90, 90}), picture_of({90, 90, 90, 90, 90, 90})),
      difference / 2, 1e-9);
}

}  // namespace
}  // namespace dehaze
