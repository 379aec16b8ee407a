// Sums and maxima over every second row and column.
#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/atmospheric_light.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/stripe_workers.h"

namespace haze::test {
namespace {

constexpr int kStripes = 8;
constexpr int kNoStripes[] = {-1, -8, 8, 9, 10, 80, INT_MAX, INT_MIN};

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

struct Partials {
  std::array<int, kStripes> sums;
  std::array<uint8_t, kStripes> max_h;
  std::array<uint8_t, kStripes> max_a;

  static Partials now() {
    Partials partials = {};
    for (size_t k = 0; k < kStripes; ++k) {
      partials.sums[k] = gCalSumSum[k];
      partials.max_h[k] = gCalMaxMaxH[k];
      partials.max_a[k] = gCalMaxMaxA[k];
    }
    return partials;
  }
  void put() const {
    for (size_t k = 0; k < kStripes; ++k) {
      gCalSumSum[k] = sums[k];
      gCalMaxMaxH[k] = max_h[k];
      gCalMaxMaxA[k] = max_a[k];
    }
  }
  bool operator==(const Partials& other) const {
    return sums == other.sums && max_h == other.max_h && max_a == other.max_a;
  }
};

void fill_sum_globals(uint8_t* plane, int width, int height) {
  pCalSumGSrc = plane;
  gCalSumWidth = width;
  gCalSumHeight = height;
}

void fill_max_globals(uint8_t* plane_h, uint8_t* plane_a, int width, int height) {
  gCalMaxpH = plane_h;
  gCalMaxpA = plane_a;
  gCalMaxWidth = width;
  gCalMaxHeight = height;
}

// Every stripe through the workers' inner functions, on planes that end at a page which may not be
// read.
void compare_stripes(Random& random, int width, int height) {
  PageEndBuffer<uint8_t> plane_h(make_image(random, random.one_of(kMoods), width, height));
  PageEndBuffer<uint8_t> plane_a(make_image(random, random.one_of(kMoods), width, height));
  fill_sum_globals(plane_h.data(), width, height);
  fill_max_globals(plane_h.data(), plane_a.data(), width, height);
  Partials want = {};
  want.sums.fill(5);
  want.put();
  for (int k = 0; k < kStripes; ++k) {
    CalSum(k);
    CalMax(k);
    const size_t at = static_cast<size_t>(k);
    want.sums[at] += static_cast<int>(reference::sampled_sum(plane_h.data(), width, height, k));
    want.max_h[at] = reference::sampled_maximum(plane_h.data(), width, height, k);
    want.max_a[at] = reference::sampled_maximum(plane_a.data(), width, height, k);
    ASSERT_EQ(Partials::now().sums, want.sums) << width << " x " << height << ", stripe " << k;
    ASSERT_EQ(Partials::now().max_h, want.max_h) << width << " x " << height << ", stripe " << k;
    ASSERT_EQ(Partials::now().max_a, want.max_a) << width << " x " << height << ", stripe " << k;
  }
}

TEST(SampledStripes, EverySmallSize) {
  Random random(test_seed());
  for (int width = 1; width <= 20; ++width)
    for (int height = 1; height <= 70; ++height) compare_stripes(random, width, height);
}

TEST(SampledStripes, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {641, 359}, {321, 1000}, {40, 57}, {57, 49}};
  for (const auto& size : sizes) compare_stripes(random, size[0], size[1]);
}

// A stripe of an odd number of rows makes the next one start at an odd row.
TEST(SampledStripes, OddStripesSampleOddRows) {
  std::vector<uint8_t> plane(area(2, 24));
  for (size_t row = 0; row < 24; ++row) plane[2 * row] = static_cast<uint8_t>(row);
  fill_sum_globals(plane.data(), 2, 24);
  for (int k = 0; k < kStripes; ++k) {
    gCalSumSum[k] = 0;
    CalSum(k);
    EXPECT_EQ(gCalSumSum[k], 3 * k + 3 * k + 2) << "stripe " << k;
  }
}

// Rows 0 and 2 of the first stripe: the second of them is sampled at columns 1 and, in the row
// below, 0.
TEST(SampledStripes, OddWidthsDriftToTheRight) {
  std::vector<uint8_t> plane(area(3, 32), 100);
  plane[0] = 1;
  plane[2] = 2;
  plane[3 * 2 + 1] = 4;
  plane[3 * 3] = 8;
  fill_sum_globals(plane.data(), 3, 32);
  fill_max_globals(plane.data(), plane.data(), 3, 32);
  Partials{}.put();
  CalSum(0);
  CalMax(0);
  EXPECT_EQ(gCalSumSum[0], 15);
  EXPECT_EQ(gCalMaxMaxH[0], 8);
  EXPECT_EQ(gCalMaxMaxA[0], 8);
}

// The last row of the last stripe starts one byte to the right, so that its last sample is past the
// plane.
TEST(SampledStripes, SamplesPastThePlaneDoNotCount) {
  std::vector<uint8_t> plane(area(3, 31) + 3, 100);
  plane[3 * 28] = 1;
  plane[3 * 28 + 2] = 2;
  plane[3 * 30 + 1] = 4;
  fill_sum_globals(plane.data(), 3, 31);
  fill_max_globals(plane.data(), plane.data(), 3, 31);
  Partials{}.put();
  CalSum(7);
  CalMax(7);
  EXPECT_EQ(gCalSumSum[7], 7);
  EXPECT_EQ(gCalMaxMaxH[7], 4);
}

// 9 rows in stripes of 2: the fifth has one row, the later ones lie below the plane.
TEST(SampledStripes, StripesBelowThePlaneAreEmpty) {
  std::vector<uint8_t> plane(area(4, 20), 200);
  fill_sum_globals(plane.data(), 4, 9);
  fill_max_globals(plane.data(), plane.data(), 4, 9);
  Partials{}.put();
  for (int k = 0; k < kStripes; ++k) {
    CalSum(k);
    CalMax(k);
  }
  Partials want = {};
  for (size_t k = 0; k < 5; ++k) {
    want.sums[k] = 400;
    want.max_h[k] = want.max_a[k] = 200;
  }
  EXPECT_TRUE(Partials::now() == want);
}

TEST(SampledStripes, SumsAreAddedModulo32Bits) {
  std::vector<uint8_t> plane(area(4, 16), 1);
  fill_sum_globals(plane.data(), 4, 16);
  gCalSumSum[3] = INT_MAX;
  CalSum(3);
  EXPECT_EQ(gCalSumSum[3], INT_MIN + 1);
  CalSum(3);
  EXPECT_EQ(gCalSumSum[3], INT_MIN + 3);
}

TEST(SampledStripes, MaximaAreRaisedOnly) {
  std::vector<uint8_t> plane_h(area(4, 16), 90);
  std::vector<uint8_t> plane_a(area(4, 16), 110);
  fill_max_globals(plane_h.data(), plane_a.data(), 4, 16);
  Partials{}.put();
  gCalMaxMaxH[2] = 100;
  gCalMaxMaxA[2] = 100;
  CalMax(2);
  EXPECT_EQ(gCalMaxMaxH[2], 100);
  EXPECT_EQ(gCalMaxMaxA[2], 110);
}

TEST(SampledStripes, WorkersTakeTheStripeAlone) {
  Random random(test_seed());
  std::vector<uint8_t> plane_h = make_image(random, Mood::kNoise, 30, 41);
  std::vector<uint8_t> plane_a = make_image(random, Mood::kNoise, 30, 41);
  fill_sum_globals(plane_h.data(), 30, 41);
  fill_max_globals(plane_h.data(), plane_a.data(), 30, 41);
  Partials want = {};
  want.put();
  for (const int k : {6, 0, 7, 3, 1, 2, 5, 4}) {
    run_worker(CalSumThreadIntermate, k);
    run_worker(CalMaxPthreadIntermate, k);
    const size_t at = static_cast<size_t>(k);
    want.sums[at] = static_cast<int>(reference::sampled_sum(plane_h.data(), 30, 41, k));
    want.max_h[at] = reference::sampled_maximum(plane_h.data(), 30, 41, k);
    want.max_a[at] = reference::sampled_maximum(plane_a.data(), 30, 41, k);
    EXPECT_TRUE(Partials::now() == want) << "stripe " << k;
  }
}

TEST(SampledStripes, OtherStripesTouchNothing) {
  std::vector<uint8_t> plane(area(16, 16), 70);
  fill_sum_globals(plane.data(), 16, 16);
  fill_max_globals(plane.data(), plane.data(), 16, 16);
  Partials want = {};
  want.sums.fill(3);
  want.put();
  for (const int k : kNoStripes) {
    CalSum(k);
    CalMax(k);
    run_worker(CalSumThreadIntermate, k);
    run_worker(CalMaxPthreadIntermate, k);
    EXPECT_TRUE(Partials::now() == want) << k;
  }
}

TEST(SampledStripes, EmptySizesTouchNothing) {
  std::vector<uint8_t> plane(1024, 70);
  const int sizes[][2] = {{0, 0},   {0, 16},  {16, 0},      {-8, 16},     {16, -8},
                          {-8, -8}, {-1, -1}, {INT_MIN, 8}, {8, INT_MIN}, {1, -1}};
  Partials want = {};
  want.sums.fill(3);
  want.put();
  for (const auto& size : sizes) {
    fill_sum_globals(plane.data() + 512, size[0], size[1]);
    fill_max_globals(plane.data() + 512, plane.data() + 512, size[0], size[1]);
    for (int k = 0; k < kStripes; ++k) {
      CalSum(k);
      CalMax(k);
    }
    EXPECT_TRUE(Partials::now() == want) << size[0] << " x " << size[1];
  }
}

// Both statistics by threads, with the globals that the calls leave.
void compare_threads(Random& random, int width, int height) {
  SCOPED_TRACE(testing::Message() << width << " x " << height << ", seed " << test_seed());
  const std::vector<uint8_t> content_h = make_image(random, random.one_of(kMoods), width, height);
  const std::vector<uint8_t> content_a = make_image(random, random.one_of(kMoods), width, height);
  GuardedBuffer<uint8_t> plane_h(content_h);
  GuardedBuffer<uint8_t> plane_a(content_a);
  // Rests of earlier calls, which must not enter.
  Partials want = {};
  want.sums.fill(12345);
  want.max_h.fill(255);
  want.max_a.fill(255);
  want.put();

  uint32_t sum = 0;
  for (int k = 0; k < kStripes; ++k) {
    const uint32_t part = reference::sampled_sum(content_h.data(), width, height, k);
    want.sums[static_cast<size_t>(k)] = static_cast<int>(part);
    sum += part;
  }
  EXPECT_EQ(CalSumThreadPreview(plane_h.data(), width, height), static_cast<int>(sum));
  EXPECT_TRUE(Partials::now() == want);
  EXPECT_EQ(pCalSumGSrc, plane_h.data());
  EXPECT_EQ(gCalSumWidth, width);
  EXPECT_EQ(gCalSumHeight, height);

  uint8_t max_h = 0;
  uint8_t max_a = 0;
  for (int k = 0; k < kStripes; ++k) {
    const size_t at = static_cast<size_t>(k);
    want.max_h[at] = reference::sampled_maximum(content_h.data(), width, height, k);
    want.max_a[at] = reference::sampled_maximum(content_a.data(), width, height, k);
    if (want.max_h[at] > max_h) max_h = want.max_h[at];
    if (want.max_a[at] > max_a) max_a = want.max_a[at];
  }
  GuardedBuffer<uint8_t> maxima(2, 0xA5);
  CalMaxThreadPreview(plane_h.data(), plane_a.data(), width, height, maxima.data(),
                      maxima.data() + 1);
  EXPECT_EQ(maxima[0], max_h);
  EXPECT_EQ(maxima[1], max_a);
  EXPECT_TRUE(Partials::now() == want);
  EXPECT_EQ(gCalMaxpH, plane_h.data());
  EXPECT_EQ(gCalMaxpA, plane_a.data());
  EXPECT_EQ(gCalMaxWidth, width);
  EXPECT_EQ(gCalMaxHeight, height);
  EXPECT_TRUE(bytes_match(plane_h, content_h));
  EXPECT_TRUE(bytes_match(plane_a, content_a));
}

TEST(SampledStatistics, EverySideUpTo40) {
  Random random(test_seed());
  for (int side = 1; side <= 40; ++side) compare_threads(random, side, 1 + 7 * side % 40);
}

TEST(SampledStatistics, FrameSizes) {
  Random random(test_seed());
  compare_threads(random, 640, 360);
  compare_threads(random, 1280, 720);
  compare_threads(random, 641, 359);
}

TEST(SampledStatistics, PlaneOfOnes) {
  std::vector<uint8_t> plane(area(4, 16), 1);
  EXPECT_EQ(CalSumThreadPreview(plane.data(), 4, 16), 16);
}

// Each stripe's maximum is the greatest of all in turn.
TEST(SampledStatistics, MaximumOfEveryStripeCounts) {
  for (size_t stripe = 0; stripe < kStripes; ++stripe) {
    std::vector<uint8_t> plane_h(area(4, 16), 10);
    std::vector<uint8_t> plane_a(area(4, 16), 20);
    plane_h[stripe * 8 + 2] = 30;
    plane_a[(7 - stripe) * 8] = 40;
    uint8_t max_h = 0;
    uint8_t max_a = 0;
    CalMaxThreadPreview(plane_h.data(), plane_a.data(), 4, 16, &max_h, &max_a);
    EXPECT_EQ(max_h, 30) << stripe;
    EXPECT_EQ(max_a, 40) << stripe;
  }
}

// 4096 * 2064 samples of 255 are 2 155 806 720, which wraps to a negative number.
TEST(SampledStatistics, SumOfAllStripesWraps) {
  std::vector<uint8_t> plane(8192u * 4128u, 255);
  EXPECT_EQ(CalSumThreadPreview(plane.data(), 8192, 4128), -2139160576);
}

TEST(SampledStatistics, EmptySizes) {
  std::vector<uint8_t> plane(1024, 70);
  const int sizes[][2] = {{0, 0},   {0, 16},  {16, 0},      {-8, 16},     {16, -8},
                          {-8, -8}, {-1, -1}, {INT_MIN, 8}, {8, INT_MIN}, {1, -1}};
  for (const auto& size : sizes) {
    SCOPED_TRACE(testing::Message() << size[0] << " x " << size[1]);
    EXPECT_EQ(CalSumThreadPreview(plane.data() + 512, size[0], size[1]), 0);
    GuardedBuffer<uint8_t> maxima(2, 0xA5);
    CalMaxThreadPreview(plane.data() + 512, plane.data() + 512, size[0], size[1], maxima.data(),
                        maxima.data() + 1);
    EXPECT_TRUE(all_bytes_are(maxima, 0xA5));
  }
}

}  // namespace
}  // namespace haze::test
