#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <cstdint>
#include <limits>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/box_float.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using reference::Averaged;
using Plane = std::vector<float>;

constexpr uint8_t kUnwritten = 0xA5;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

Plane expected(const Plane& a, const Plane& b, Averaged quantity, int width, int height,
               int radius) {
  return reference::box_mean_float(a.data(), b.data(), quantity, width, height, radius);
}

// What every member of the family gave for the planes a and b.
struct Means {
  explicit Means(size_t count)
      : mean(count, kUnwritten),
        square(count, kUnwritten),
        product(count, kUnwritten),
        two{GuardedBuffer<float>(count, kUnwritten), GuardedBuffer<float>(count, kUnwritten)},
        four{GuardedBuffer<float>(count, kUnwritten), GuardedBuffer<float>(count, kUnwritten),
             GuardedBuffer<float>(count, kUnwritten), GuardedBuffer<float>(count, kUnwritten)} {}

  void compute(float* a, float* b, int width, int height, int radius) {
    AverageFilter_fPreview(a, mean.data(), width, height, radius);
    AverageFilter_f_2Preview(b, square.data(), width, height, radius);
    AverageFilter_fPreview(a, b, product.data(), width, height, radius);
    AverageFilter_f_Out2Preview(a, b, two[0].data(), two[1].data(), width, height, radius);
    AverageFilter_f_Out4Preview(a, b, four[0].data(), four[1].data(), four[2].data(),
                                four[3].data(), width, height, radius);
  }

  GuardedBuffer<float> mean;
  GuardedBuffer<float> square;
  GuardedBuffer<float> product;
  GuardedBuffer<float> two[2];
  GuardedBuffer<float> four[4];
};

void compare(const Plane& a, const Plane& b, int width, int height, int radius) {
  GuardedBuffer<float> first(a);
  GuardedBuffer<float> second(b);
  Means actual(a.size());
  actual.compute(first.data(), second.data(), width, height, radius);

  struct Result {
    const char* name;
    const GuardedBuffer<float>& plane;
    Averaged quantity;
  };
  const Result results[] = {
      {"mean", actual.mean, Averaged::kFirst},
      {"mean of two, first", actual.two[0], Averaged::kFirst},
      {"mean of four, first", actual.four[0], Averaged::kFirst},
      {"mean of two, second", actual.two[1], Averaged::kSecond},
      {"mean of four, second", actual.four[1], Averaged::kSecond},
      {"product", actual.product, Averaged::kProduct},
      {"product of four", actual.four[2], Averaged::kProduct},
      {"square", actual.square, Averaged::kSecondSquared},
      {"square of four", actual.four[3], Averaged::kSecondSquared},
  };
  Plane want;
  Averaged wanted = Averaged::kSecondSquared;
  for (const Result& result : results) {
    if (want.empty() || result.quantity != wanted)
      want = expected(a, b, result.quantity, width, height, radius);
    wanted = result.quantity;
    ASSERT_TRUE(
        planes_match(result.plane, want,
                     {{"radius", radius}, {"width", width}, {"height", height}, {"row", width}}))
        << result.name;
  }
  ASSERT_TRUE(planes_match(first, a));
  ASSERT_TRUE(planes_match(second, b));
}

void compare_random(Random& random, FloatMood mood, int width, int height, int radius) {
  compare(make_plane(random, mood, width, height), make_plane(random, mood, width, height), width,
          height, radius);
}

Plane mean_of(Plane src, int width, int height, int radius) {
  Plane dst(src.size(), -1.0f);
  AverageFilter_fPreview(src.data(), dst.data(), width, height, radius);
  return dst;
}

Plane freshly_summed(const Plane& src, int width, int height, int radius) {
  Plane means;
  for (const double mean : reference::box_mean_by_windows(src.data(), src.data(), Averaged::kFirst,
                                                          width, height, radius))
    means.push_back(static_cast<float>(mean));
  return means;
}

// Sums of small whole numbers are exact, so there the procedure must give the plain mean.
TEST(BoxFloatReference, IsTheWindowMeanOfWholeNumbers) {
  Random random(test_seed());
  for (int radius = 1; radius <= 6; ++radius)
    for (int extra = 0; extra < 4; ++extra) {
      const int width = 2 * radius + 1 + extra;
      const int height = 2 * radius + 1 + (extra * 3) % 4;
      const Plane a = make_plane(random, FloatMood::kIntegers, width, height);
      const Plane b = make_plane(random, FloatMood::kIntegers, width, height);
      for (const Averaged quantity :
           {Averaged::kFirst, Averaged::kSecond, Averaged::kProduct, Averaged::kSecondSquared}) {
        const std::vector<double> means =
            reference::box_mean_by_windows(a.data(), b.data(), quantity, width, height, radius);
        const Plane want(means.begin(), means.end());
        EXPECT_TRUE(planes_match(expected(a, b, quantity, width, height, radius), want));
      }
    }
}

// Constants whose multiples are exact; others may come back a rounding error off.
TEST(BoxFloat, ConstantPlaneStaysConstant) {
  for (const float value : {0.0f, 1.0f, 0.5f, 0.375f, -7.0f, 255.0f, 4096.0f})
    for (const int radius : {1, 2, 7, 20}) {
      const int width = 2 * radius + 5;
      const int height = 2 * radius + 3;
      const Plane src(area(width, height), value);
      EXPECT_TRUE(planes_match(mean_of(src, width, height, radius), src, {{"radius", radius}}));
      compare(src, Plane(src.size(), 0.25f), width, height, radius);
    }
}

TEST(BoxFloat, CornerAndEdgeWindows) {
  constexpr int kWidth = 12;
  constexpr int kHeight = 9;
  constexpr int kRadius = 3;
  Plane src(area(kWidth, kHeight));
  for (size_t i = 0; i < src.size(); ++i) src[i] = static_cast<float>(i * i % 97);
  const auto sum_of = [&](int first_x, int last_x, int last_y) {
    float sum = 0.0f;
    for (int y = 0; y <= last_y; ++y)
      for (int x = first_x; x <= last_x; ++x) sum += src[static_cast<size_t>(y * kWidth + x)];
    return sum;
  };
  const Plane means = mean_of(src, kWidth, kHeight, kRadius);
  EXPECT_EQ(means[0], sum_of(0, 3, 3) / 16.0f);
  EXPECT_EQ(means[5], sum_of(2, 8, 3) / 28.0f);
  EXPECT_EQ(means[4 * kWidth + 5], (sum_of(2, 8, 7) - sum_of(2, 8, 0)) / 49.0f);
}

TEST(BoxFloat, Radius1Of3x3) {
  const Plane src = {1.0f, 2.0f, 3.0f, 4.0f, 5.0f, 6.0f, 7.0f, 8.0f, 10.0f};
  const Plane want = {12.0f / 4, 21.0f / 6, 16.0f / 4, 27.0f / 6, 46.0f / 9,
                      34.0f / 6, 24.0f / 4, 40.0f / 6, 29.0f / 4};
  EXPECT_TRUE(planes_match(mean_of(src, 3, 3, 1), want));
}

TEST(BoxFloat, WithoutMiddleColumnsOrRows) {
  Random random(test_seed());
  for (const int radius : {1, 2, 5, 8}) {
    const int least = 2 * radius + 1;
    for (const auto& size : {std::pair<int, int>{least, least},
                             {least, 3 * least},
                             {3 * least, least},
                             {least, least + 1},
                             {least + 1, least}}) {
      const Plane src = make_plane(random, FloatMood::kIntegers, size.first, size.second);
      EXPECT_TRUE(planes_match(mean_of(src, size.first, size.second, radius),
                               freshly_summed(src, size.first, size.second, radius)));
    }
  }
}

TEST(BoxFloat, EqualInputsGiveEqualPairsOfMeans) {
  Random random(test_seed());
  for (const FloatMood mood : kFloatMoods) {
    Plane src = make_plane(random, mood, 23, 19);
    Plane means[4] = {Plane(src.size()), Plane(src.size()), Plane(src.size()), Plane(src.size())};
    AverageFilter_f_Out4Preview(src.data(), src.data(), means[0].data(), means[1].data(),
                                means[2].data(), means[3].data(), 23, 19, 4);
    EXPECT_TRUE(planes_match(means[0], means[1]));
    EXPECT_TRUE(planes_match(means[2], means[3]));
    EXPECT_TRUE(planes_match(means[0], expected(src, src, Averaged::kFirst, 23, 19, 4)));
    EXPECT_TRUE(planes_match(means[2], expected(src, src, Averaged::kProduct, 23, 19, 4)));
  }
}

TEST(BoxFloat, SquareIsThatOfTheSecondPlane) {
  Plane a(25, 2.0f);
  Plane b(25, 3.0f);
  Plane means[4] = {Plane(25), Plane(25), Plane(25), Plane(25)};
  AverageFilter_f_Out4Preview(a.data(), b.data(), means[0].data(), means[1].data(), means[2].data(),
                              means[3].data(), 5, 5, 2);
  const float want[4] = {2.0f, 3.0f, 6.0f, 9.0f};
  for (int i = 0; i < 4; ++i) EXPECT_TRUE(planes_match(means[i], Plane(25, want[i]))) << i;
}

TEST(BoxFloat, EveryRadiusOnTheSmallestSizes) {
  Random random(test_seed());
  for (int radius = 1; radius <= 20; ++radius)
    for (const FloatMood mood : kFloatMoods)
      for (int extra = 0; extra < 3; ++extra)
        compare_random(random, mood, 2 * radius + 1 + extra, 2 * radius + 1 + (extra + radius) % 3,
                       radius);
}

TEST(BoxFloat, SizesUpTo40) {
  Random random(test_seed());
  for (const int radius : {1, 2, 3, 7})
    for (int size = 2 * radius + 1; size <= 40; ++size) {
      const int other = random.between(2 * radius + 1, 40);
      compare_random(random, random.one_of(kFloatMoods), size, other, radius);
      compare_random(random, random.one_of(kFloatMoods), other, size, radius);
    }
}

TEST(BoxFloat, FrameSizes) {
  Random random(test_seed());
  compare_random(random, FloatMood::kUnit, 640, 360, 8);
  compare_random(random, FloatMood::kWideRange, 641, 119, 20);
  compare_random(random, FloatMood::kLarge, 1280, 720, 15);
  compare_random(random, FloatMood::kMixedSigns, 3, 2001, 1);
  compare_random(random, FloatMood::kOffset, 2001, 5, 2);
}

// Rounding errors of the carried sums add up down the image and are part of the result.
TEST(BoxFloat, RunningSumsDrift) {
  constexpr int kWidth = 64;
  constexpr int kHeight = 600;
  Random random(test_seed());
  Plane src = make_plane(random, FloatMood::kUnit, kWidth, kHeight);
  // A bright band at the top costs all later sums their low bits.
  for (size_t i = 0; i < 40 * kWidth; ++i) src[i] = 1.0e8f + 1.0e7f * src[i];
  const Plane means = mean_of(src, kWidth, kHeight, 6);
  EXPECT_TRUE(planes_match(means, expected(src, src, Averaged::kFirst, kWidth, kHeight, 6)));
  const Plane fresh = freshly_summed(src, kWidth, kHeight, 6);
  float largest = 0.0f;
  for (size_t i = 500 * kWidth; i < means.size(); ++i)
    largest = std::fmax(largest, std::fabs(means[i] - fresh[i]));
  EXPECT_GT(largest, 0.01f);
  compare(src, make_plane(random, FloatMood::kOffset, kWidth, kHeight), kWidth, kHeight, 6);
}

// A sum of negative zeros is one, too, until a difference of two turns it positive.
TEST(BoxFloat, NegativeZeros) {
  const Plane zeros(area(9, 9), -0.0f);
  compare(zeros, zeros, 9, 9, 1);
  compare(zeros, zeros, 9, 9, 2);
  compare(zeros, Plane(zeros.size(), 1.0f), 9, 9, 3);
  EXPECT_TRUE(std::signbit(mean_of(zeros, 9, 9, 2)[0]));
  EXPECT_FALSE(std::signbit(mean_of(zeros, 9, 9, 2)[40]));
}

TEST(BoxFloat, InfiniteAndNotANumber) {
  constexpr float kInfinity = std::numeric_limits<float>::infinity();
  Random random(test_seed());
  for (const float odd : {kInfinity, -kInfinity, std::numeric_limits<float>::quiet_NaN()})
    for (int i = 0; i < 12; ++i) {
      const int width = random.between(7, 20);
      const int height = random.between(7, 20);
      Plane a = make_plane(random, FloatMood::kUnit, width, height);
      const Plane b = make_plane(random, FloatMood::kMixedSigns, width, height);
      a[static_cast<size_t>(random.between(0, width * height - 1))] = odd;
      compare(a, b, width, height, random.between(1, 3));
      compare(b, a, width, height, random.between(1, 3));
    }
  // Sums and products beyond the largest number.
  Plane huge = make_plane(random, FloatMood::kMixedSigns, 16, 16);
  for (float& value : huge) value *= 2.0e35f;
  compare(huge, huge, 16, 16, 3);
}

TEST(BoxFloat, OtherSizesAndRadiiWriteNothing) {
  struct Case {
    int width, height, radius;
  };
  const Case cases[] = {
      {9, 9, 0},       {9, 9, -1},          {9, 9, -4},      {9, 9, INT_MIN},
      {9, 9, 5},       {2, 9, 1},           {9, 2, 1},       {4, 40, 2},
      {40, 4, 2},      {0, 9, 1},           {9, 0, 1},       {-9, 9, 1},
      {9, -9, 1},      {-9, -9, 1},         {1, 1, 0},       {0, 0, 0},
      {9, 9, INT_MAX}, {9, 9, INT_MAX / 2}, {9, 9, 1 << 30}, {9, 9, (1 << 30) + 1},
      {INT_MIN, 9, 1}, {9, INT_MIN, 1},     {-9, -9, -5},    {9, 9, 1 - (1 << 30)},
  };
  for (const Case& c : cases) {
    Plane a(1600, 1.0f);
    Plane b(1600, 2.0f);
    Means actual(1600);
    actual.compute(a.data(), b.data(), c.width, c.height, c.radius);
    const std::initializer_list<Argument> arguments = {
        {"width", c.width}, {"height", c.height}, {"radius", c.radius}};
    EXPECT_TRUE(floats_are_untouched(actual.mean, kUnwritten, arguments));
    EXPECT_TRUE(floats_are_untouched(actual.square, kUnwritten, arguments));
    EXPECT_TRUE(floats_are_untouched(actual.product, kUnwritten, arguments));
    for (const auto& plane : actual.two)
      EXPECT_TRUE(floats_are_untouched(plane, kUnwritten, arguments));
    for (const auto& plane : actual.four)
      EXPECT_TRUE(floats_are_untouched(plane, kUnwritten, arguments));
  }
}

TEST(BoxFloat, TouchesNothingPastTheBuffers) {
  Random random(test_seed());
  for (int width = 5; width <= 24; ++width) {
    const Plane content = make_plane(random, FloatMood::kUnit, width, 6);
    PageEndBuffer<float> a(content);
    PageEndBuffer<float> b(content);
    PageEndBuffer<float> means[4] = {
        PageEndBuffer<float>(content.size()), PageEndBuffer<float>(content.size()),
        PageEndBuffer<float>(content.size()), PageEndBuffer<float>(content.size())};
    AverageFilter_f_Out4Preview(a.data(), b.data(), means[0].data(), means[1].data(),
                                means[2].data(), means[3].data(), width, 6, 2);
    EXPECT_TRUE(planes_match(means[1], expected(content, content, Averaged::kSecond, width, 6, 2)));
    AverageFilter_f_Out2Preview(a.data(), b.data(), means[2].data(), means[3].data(), width, 6, 1);
    EXPECT_TRUE(planes_match(means[3], expected(content, content, Averaged::kSecond, width, 6, 1)));
    AverageFilter_fPreview(a.data(), b.data(), means[0].data(), width, 6, 2);
    AverageFilter_f_2Preview(a.data(), means[1].data(), width, 6, 2);
    EXPECT_TRUE(planes_match(means[0], means[1]));
    AverageFilter_fPreview(a.data(), means[0].data(), width, 6, 2);
    EXPECT_TRUE(planes_match(means[0], expected(content, content, Averaged::kFirst, width, 6, 2)));
  }
}

TEST(BoxFloatThreads, IndependentCalls) {
  constexpr int kWidth = 70;
  constexpr int kHeight = 60;
  Random random(test_seed());
  std::vector<Plane> planes;
  std::vector<Plane> means(4);
  for (int i = 0; i < 4; ++i) {
    planes.push_back(make_plane(random, FloatMood::kMixedSigns, kWidth, kHeight));
    means[static_cast<size_t>(i)].resize(planes.back().size());
  }
  std::vector<std::thread> threads;
  for (size_t i = 0; i < 4; ++i)
    threads.emplace_back([&planes, &means, i] {
      for (int round = 0; round < 5; ++round)
        AverageFilter_fPreview(planes[i].data(), means[i].data(), kWidth, kHeight,
                               static_cast<int>(i) + 1);
    });
  for (std::thread& thread : threads) thread.join();
  for (size_t i = 0; i < 4; ++i)
    EXPECT_TRUE(planes_match(means[i], expected(planes[i], planes[i], Averaged::kFirst, kWidth,
                                                kHeight, static_cast<int>(i) + 1)));
}

}  // namespace
}  // namespace haze::test
