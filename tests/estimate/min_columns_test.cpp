// Running minima down the columns of a stripe inside wider images.
#include <gtest/gtest.h>

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

// A stripe inside images with longer rows: what lies beside it is neither changed nor counted.
void expect_stripe_of_columns(Random& random, int stride, int first, int columns, int height,
                              int radius) {
  const std::vector<uint8_t> content = make_image(random, random.one_of(kMoods), stride, height);
  GuardedBuffer<uint8_t> src(content);
  GuardedBuffer<uint8_t> dst(content.size(), kUnwritten);
  GuardedBuffer<int> histogram(std::vector<int>(256, 40));
  gCalDCWPreview = stride;
  getMinChannel_verPreview(src.data() + first, dst.data() + first, columns, height, radius,
                           histogram.data());
  const std::vector<uint8_t> minima =
      reference::column_minimum(content.data(), stride, height, radius);
  std::vector<uint8_t> want(content.size(), kUnwritten);
  for (int y = 0; y < height; ++y)
    for (int x = first; x < first + columns; ++x) {
      const size_t at = area(y, stride) + static_cast<size_t>(x);
      want[at] = minima[at];
    }
  std::vector<int> bins =
      reference::histogram_of_columns(minima.data(), stride, height, first, columns);
  for (int& bin : bins) bin += 40;
  ASSERT_TRUE(bytes_match(dst, want,
                          {{"first", first},
                           {"columns", columns},
                           {"height", height},
                           {"radius", radius},
                           {"row", stride}}));
  ASSERT_EQ(std::vector<int>(histogram.data(), histogram.data() + 256), bins);
  ASSERT_TRUE(bytes_match(src, content));
  ASSERT_EQ(gCalDCWPreview, stride);
}

TEST(MinColumns, EveryRadiusAndHeight) {
  Random random(test_seed());
  for (int radius = 0; radius <= 20; ++radius)
    for (int height = 1; height <= 50; ++height) {
      const int columns = random.between(1, 20);
      const int first = random.between(0, 5);
      expect_stripe_of_columns(random, first + columns + random.between(0, 5), first, columns,
                               height, radius);
    }
}

TEST(MinColumns, EveryWidth) {
  Random random(test_seed());
  for (int columns = 1; columns <= 200; ++columns)
    expect_stripe_of_columns(random, columns + 3, 2, columns, 33, random.between(0, 12));
}

TEST(MinColumns, RadiusBeyondTheImage) {
  Random random(test_seed());
  for (const int radius : {9, 100, 1 << 30, INT_MAX / 2 + 1, INT_MAX})
    expect_stripe_of_columns(random, 12, 3, 7, 10, radius);
}

// Rows end where the stripe's last one does, not where the stride says.
TEST(MinColumns, TouchNothingPastTheLastColumn) {
  Random random(test_seed());
  constexpr int kStride = 24;
  constexpr int kHeight = 9;
  for (int columns = 1; columns <= kStride; ++columns) {
    const size_t bytes = area(kHeight - 1, kStride) + static_cast<size_t>(columns);
    std::vector<uint8_t> content = make_image(random, Mood::kNoise, kStride, kHeight);
    const std::vector<uint8_t> minima =
        reference::column_minimum(content.data(), kStride, kHeight, 2);
    content.resize(bytes);
    PageEndBuffer<uint8_t> src(content);
    PageEndBuffer<uint8_t> dst(bytes);
    std::vector<int> bins(256);
    gCalDCWPreview = kStride;
    getMinChannel_verPreview(src.data(), dst.data(), columns, kHeight, 2, bins.data());
    std::vector<uint8_t> want(bytes);
    for (size_t i = 0; i < bytes; ++i)
      if (i % kStride < static_cast<size_t>(columns)) want[i] = minima[i];
    EXPECT_TRUE(bytes_match(dst, want, {{"columns", columns}, {"row", kStride}}));
  }
}

TEST(MinColumns, NoColumnsOrRowsAndNegativeRadiiWriteNothing) {
  std::vector<uint8_t> src(1024, 70);
  const int cases[][3] = {{0, 8, 1},       {8, 0, 1},   {-1, 8, 1},     {8, -1, 1},
                          {-8, -8, 1},     {8, 8, -1},  {8, 8, -9},     {INT_MIN, 8, 0},
                          {8, INT_MIN, 0}, {-4, -4, 0}, {8, 8, INT_MIN}};
  gCalDCWPreview = 16;
  for (const auto& arguments : cases) {
    GuardedBuffer<uint8_t> dst(1024, kUnwritten);
    std::vector<int> bins(256, 5);
    getMinChannel_verPreview(src.data() + 512, dst.data() + 512, arguments[0], arguments[1],
                             arguments[2], bins.data());
    EXPECT_TRUE(all_bytes_are(
        dst, kUnwritten,
        {{"columns", arguments[0]}, {"height", arguments[1]}, {"radius", arguments[2]}}));
    EXPECT_EQ(bins, std::vector<int>(256, 5));
  }
}

}  // namespace
}  // namespace haze::test
