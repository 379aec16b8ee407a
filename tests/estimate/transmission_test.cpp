#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdint>
#include <limits>
#include <ostream>
#include <string>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/session.h"
#include "tests/reference/transmission.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using reference::GroupMinimum;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNotANumber = std::numeric_limits<float>::quiet_NaN();
constexpr uint8_t kUnwritten = 0xA5;

// The two versions on the caller's thread with the minimum that their high lanes take.
struct FlatVersion {
  const char* name;
  void (*compute)(unsigned char*, unsigned char*, unsigned char*, int, int, float, float);
  GroupMinimum group_minimum;
};

const FlatVersion kOwnMinimum = {"NeonFloat", CalculateTChannelPreviewNeonFloat,
                                 GroupMinimum::kOwn};
const FlatVersion kLaneDefect = {"Neon", CalculateTChannelPreviewNeon, GroupMinimum::kLowHalfTwice};

// Every pair (S, M), S changing slowest; `rotation` moves M to other lanes of its group.
struct BytePairs {
  explicit BytePairs(int rotation = 0) : means(65536), mins(65536) {
    for (int i = 0; i < 65536; ++i) {
      means[static_cast<size_t>(i)] = static_cast<uint8_t>(i / 256);
      mins[static_cast<size_t>(i)] = static_cast<uint8_t>((i + rotation) % 256);
    }
  }

  std::vector<uint8_t> means;
  std::vector<uint8_t> mins;
};

void compare(const FlatVersion& version, const std::vector<uint8_t>& means,
             const std::vector<uint8_t>& mins, int width, int height, float strength,
             float inv_light) {
  std::vector<uint8_t> want(means.size());
  reference::transmission_map(means.data(), mins.data(), want.data(), width, height, strength,
                              inv_light, version.group_minimum);
  GuardedBuffer<uint8_t> mean_map(means);
  GuardedBuffer<uint8_t> min_map(mins);
  GuardedBuffer<uint8_t> codes(means.size(), kUnwritten);
  version.compute(mean_map.data(), min_map.data(), codes.data(), width, height, strength,
                  inv_light);
  ASSERT_TRUE(bytes_match(
      codes, want,
      {{"width", width}, {"height", height}, {"strength", strength}, {"invA", inv_light}}))
      << version.name;
  ASSERT_TRUE(bytes_match(mean_map, means));
  ASSERT_TRUE(bytes_match(min_map, mins));
}

std::vector<uint8_t> uniform_map(const FlatVersion& version, int count, uint8_t mean, uint8_t min,
                                 float strength, float inv_light) {
  std::vector<uint8_t> means(static_cast<size_t>(count), mean);
  std::vector<uint8_t> mins(means.size(), min);
  std::vector<uint8_t> codes(means.size(), kUnwritten);
  version.compute(means.data(), mins.data(), codes.data(), count, 1, strength, inv_light);
  return codes;
}

void PrintTo(const FlatVersion& version, std::ostream* out) { *out << version.name; }

class FlatTransmission : public ::testing::TestWithParam<FlatVersion> {};

INSTANTIATE_TEST_SUITE_P(Versions, FlatTransmission, ::testing::Values(kOwnMinimum, kLaneDefect),
                         [](const auto& version) { return std::string(version.param.name); });

// A not-a-number tells groups of eight (code 0) from the tail (code 40).
TEST_P(FlatTransmission, SplitsGroupsOfEightFromTheTail) {
  for (int count = 1; count <= 40; ++count) {
    const std::vector<uint8_t> codes = uniform_map(GetParam(), count, 9, 0, 1.0f, kInfinity);
    for (int i = 0; i < count; ++i)
      EXPECT_EQ(codes[static_cast<size_t>(i)], i < count / 8 * 8 ? 0 : 40)
          << "pixel " << i << " of " << count;
  }
}

TEST_P(FlatTransmission, SevenEightAndThirteenPixels) {
  const std::vector<uint8_t> seven(7, 40);
  const std::vector<uint8_t> eight(8, 0);
  std::vector<uint8_t> thirteen = eight;
  thirteen.insert(thirteen.end(), 5, 40);
  EXPECT_TRUE(bytes_match(uniform_map(GetParam(), 7, 0, 0, 1.0f, kInfinity), seven));
  EXPECT_TRUE(bytes_match(uniform_map(GetParam(), 8, 0, 0, 1.0f, kInfinity), eight));
  EXPECT_TRUE(bytes_match(uniform_map(GetParam(), 13, 0, 0, 1.0f, kInfinity), thirteen));
}

TEST_P(FlatTransmission, BlackIsClear) {
  for (const float inv_light : {1.0f / 255.0f, 1.0f, 0.0f, -1.0f})
    EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 0, 0, 2.0f, inv_light), 158));
}

TEST_P(FlatTransmission, LightItselfIsOpaque) {
  EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 255, 255, 1.0f, 1.0f / 255.0f), 40));
}

TEST_P(FlatTransmission, ZeroStrengthIsClear) {
  Random random(test_seed());
  for (int i = 0; i < 50; ++i)
    EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, random.byte(), random.byte(), 0.0f,
                                          1.0f / static_cast<float>(random.between(1, 255))),
                              158));
}

TEST_P(FlatTransmission, CodesInsideTheBand) {
  EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 128, 255, 1.0f, 1.0f / 256.0f), 60));
  EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 255, 128, 1.0f, 1.0f / 256.0f), 60));
  EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 64, 64, 1.0f, 1.0f / 256.0f), 110));
}

TEST_P(FlatTransmission, NoLight) {
  // m > 0: t = -infinity on both paths.
  EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 1, 1, 0.5f, kInfinity), 40));
  // m < 0: t = +infinity.
  EXPECT_TRUE(all_bytes_are(uniform_map(GetParam(), 21, 1, 1, -0.5f, kInfinity), 158));
  // m = 0: not a number.
  std::vector<uint8_t> want(16, 0);
  want.insert(want.end(), 5, 40);
  EXPECT_TRUE(bytes_match(uniform_map(GetParam(), 21, 1, 0, 0.5f, kInfinity), want));
}

TEST_P(FlatTransmission, EveryCountUpTo40InEveryMood) {
  Random random(test_seed());
  for (int count = 1; count <= 40; ++count)
    for (const Mood mood : kMoods)
      compare(GetParam(), make_image(random, mood, count, 1), make_image(random, mood, count, 1),
              count, 1, reference::strength_of_level(random.between(-50, 250)),
              reference::inverse_light(random.between(0, 255)));
}

TEST_P(FlatTransmission, WidthAndHeightOnlyCountPixels) {
  Random random(test_seed());
  for (int i = 0; i < 60; ++i) {
    const int width = random.between(1, 50);
    const int height = random.between(1, 50);
    compare(GetParam(), make_image(random, Mood::kNoise, width, height),
            make_image(random, Mood::kNoise, width, height), width, height, 1.3f, 1.0f / 180.0f);
  }
  compare(GetParam(), make_image(random, Mood::kGradient, 640, 360),
          make_image(random, Mood::kNoise, 640, 360), 640, 360, 2.0f, 1.0f / 200.0f);
}

TEST_P(FlatTransmission, EveryBytePairAtSomeLevelsAndLights) {
  for (const int rotation : {0, 4}) {
    const BytePairs pairs(rotation);
    for (const int level : {-50, 0, 1, 7, 17, 117, 250})
      for (const int light : {0, 1, 2, 23, 100, 127, 200, 255})
        compare(GetParam(), pairs.means, pairs.mins, 256, 256, reference::strength_of_level(level),
                reference::inverse_light(light));
  }
}

TEST_P(FlatTransmission, EveryBytePairInTheTail) {
  const BytePairs pairs;
  std::vector<uint8_t> means = pairs.means;
  std::vector<uint8_t> mins = pairs.mins;
  for (const int light : {0, 3, 100, 201, 255}) {
    const float strength = reference::strength_of_level(light % 2 == 0 ? 17 : 40);
    const float inv_light = reference::inverse_light(light);
    std::vector<uint8_t> codes(means.size(), kUnwritten);
    for (size_t first = 0; first < means.size(); first += 7) {
      const int count = static_cast<int>(std::min<size_t>(7, means.size() - first));
      GetParam().compute(&means[first], &mins[first], &codes[first], count, 1, strength, inv_light);
    }
    std::vector<uint8_t> want(means.size());
    for (size_t i = 0; i < want.size(); ++i)
      want[i] = reference::transmission_in_tail(means[i], mins[i], strength, inv_light);
    ASSERT_TRUE(bytes_match(codes, want, {{"light", light}, {"row", 256}}));
  }
}

// All 65536 pairs in groups and five more pixels in the tail.
TEST_P(FlatTransmission, ExtremeFactors) {
  BytePairs pairs;
  for (const int value : {0, 1, 2, 254, 255}) {
    pairs.means.push_back(static_cast<uint8_t>(value));
    pairs.mins.push_back(static_cast<uint8_t>(value / 2));
  }
  constexpr float kMax = std::numeric_limits<float>::max();
  constexpr float kMin = std::numeric_limits<float>::min();
  constexpr float kSubnormal = std::numeric_limits<float>::denorm_min() * 1000.0f;
  const int count = static_cast<int>(pairs.means.size());
  for (const float strength : {0.0f, -0.0f, -1.0f, kInfinity, -kInfinity, kNotANumber, kMax, -kMax,
                               kMin, kSubnormal, -kSubnormal})
    for (const float inv_light : {0.0f, -0.0f, kInfinity, -kInfinity, kNotANumber, kMax,
                                  -1.0f / 255.0f, kSubnormal, 1.0f / 128.0f})
      compare(GetParam(), pairs.means, pairs.mins, count, 1, strength, inv_light);
}

TEST_P(FlatTransmission, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew) {
    const int count = random.between(1, 70);
    const std::vector<uint8_t> means = make_image(random, Mood::kNoise, count, 1);
    const std::vector<uint8_t> mins = make_image(random, Mood::kNoise, count, 1);
    GuardedBuffer<uint8_t> mean_map(means, skew);
    GuardedBuffer<uint8_t> min_map(mins, skew + 1);
    GuardedBuffer<uint8_t> codes(means.size(), kUnwritten, skew + 2);
    GetParam().compute(mean_map.data(), min_map.data(), codes.data(), count, 1, 0.7f, 0.01f);
    std::vector<uint8_t> want(means.size());
    reference::transmission_map(means.data(), mins.data(), want.data(), count, 1, 0.7f, 0.01f,
                                GetParam().group_minimum);
    EXPECT_TRUE(bytes_match(codes, want, {{"skew", skew}, {"count", count}}));
  }
}

TEST_P(FlatTransmission, TouchesNothingPastTheImages) {
  Random random(test_seed());
  for (int count = 1; count <= 40; ++count) {
    PageEndBuffer<uint8_t> means(make_image(random, Mood::kNoise, count, 1));
    PageEndBuffer<uint8_t> mins(make_image(random, Mood::kNoise, count, 1));
    PageEndBuffer<uint8_t> codes(means.size());
    GetParam().compute(means.data(), mins.data(), codes.data(), count, 1, 0.7f, 0.01f);
    std::vector<uint8_t> want(means.size());
    reference::transmission_map(means.data(), mins.data(), want.data(), count, 1, 0.7f, 0.01f,
                                GetParam().group_minimum);
    EXPECT_TRUE(bytes_match(codes, want, {{"count", count}}));
  }
}

TEST_P(FlatTransmission, EmptySizesWriteNothing) {
  std::vector<uint8_t> map(256, 50);
  const int sizes[][2] = {{0, 0},       {0, 8},       {8, 0},   {-1, 8},
                          {8, -1},      {-8, 8},      {-8, -8}, {-16, -16},
                          {INT_MIN, 1}, {1, INT_MIN}, {-1, 0},  {INT_MIN, INT_MIN}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> codes(256, kUnwritten);
    GetParam().compute(map.data(), map.data(), codes.data(), size[0], size[1], 1.0f, 0.01f);
    EXPECT_TRUE(all_bytes_are(codes, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(FramePathTransmission, EveryBytePairAndLight) {
  const BytePairs pairs;
  for (int light = 0; light < 256; ++light)
    for (const int level : {40, 100})
      compare(kOwnMinimum, pairs.means, pairs.mins, 256, 256, reference::strength_of_level(level),
              reference::inverse_light(light));
}

TEST(LaneDefectTransmission, HighLanesTakeTheMinimumOfTheLowLanes) {
  std::vector<uint8_t> means(16, 255);
  std::vector<uint8_t> mins = {0, 0, 0, 0, 255, 255, 255, 255, 0, 0, 0, 0, 255, 255, 255, 255};
  std::vector<uint8_t> codes(16, kUnwritten);
  CalculateTChannelPreviewNeon(means.data(), mins.data(), codes.data(), 16, 1, 1.0f, 1.0f / 255.0f);
  EXPECT_TRUE(all_bytes_are(codes, 158));

  const std::vector<uint8_t> want = {158, 158, 158, 158, 40, 40, 40, 40,
                                     158, 158, 158, 158, 40, 40, 40, 40};
  CalculateTChannelPreviewNeonFloat(means.data(), mins.data(), codes.data(), 16, 1, 1.0f,
                                    1.0f / 255.0f);
  EXPECT_TRUE(bytes_match(codes, want));

  // The other way round the high lanes turn opaque; in the tail every pixel takes its own.
  for (uint8_t& min : mins) min = static_cast<uint8_t>(255 - min);
  const std::vector<uint8_t> tail_want = {40, 40, 40, 40, 40,  40,  40, 40,
                                          40, 40, 40, 40, 158, 158, 158};
  std::vector<uint8_t> tail_codes(15, kUnwritten);
  CalculateTChannelPreviewNeon(means.data(), mins.data(), tail_codes.data(), 15, 1, 1.0f,
                               1.0f / 255.0f);
  EXPECT_TRUE(bytes_match(tail_codes, tail_want));
}

}  // namespace
}  // namespace haze::test
