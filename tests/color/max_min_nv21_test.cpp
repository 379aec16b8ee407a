#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/max_min_nv21.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

// Runs the library on a frame of one colour and returns the maps' first bytes.
reference::MaxMin extract_uniform(uint8_t y, uint8_t cr, uint8_t cb, int half_width) {
  const int width = 2 * half_width;
  std::vector<uint8_t> luma(area(width, 2), y);
  std::vector<uint8_t> chroma(area(width, 1));
  for (size_t i = 0; i < chroma.size(); ++i) chroma[i] = i % 2 == 0 ? cr : cb;
  std::vector<uint8_t> min_map(area(half_width, 1), 0xA5);
  std::vector<uint8_t> max_map(area(half_width, 1), 0x5A);
  xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_map.data(), max_map.data(),
                                   width, 2);
  EXPECT_TRUE(all_bytes_are(min_map, min_map[0]));
  EXPECT_TRUE(all_bytes_are(max_map, max_map[0]));
  return {max_map[0], min_map[0]};
}

void expect_uniform(uint8_t y, uint8_t cr, uint8_t cb, int min, int max) {
  const reference::MaxMin by_formula = reference::max_min_of_sample(y, cr, cb);
  EXPECT_EQ(by_formula.min, min);
  EXPECT_EQ(by_formula.max, max);
  // One pixel alone, one whole step of eight, and a step with a tail.
  for (const int half_width : {1, 8, 11}) {
    const reference::MaxMin actual = extract_uniform(y, cr, cb, half_width);
    EXPECT_EQ(actual.min, min) << "half width " << half_width;
    EXPECT_EQ(actual.max, max) << "half width " << half_width;
  }
}

// Compares both maps of one random frame, whose buffers end where the contract ends.
void compare_frame(Random& random, Mood luma_mood, Mood chroma_mood, int width, int height,
                   size_t skew = 0) {
  const int half_width = width / 2;
  const int half_height = height / 2;
  const std::vector<uint8_t> luma_content = make_image(random, luma_mood, width, height);
  const std::vector<uint8_t> chroma_content = make_image(random, chroma_mood, width, half_height);
  GuardedBuffer<uint8_t> luma(luma_content, skew);
  GuardedBuffer<uint8_t> chroma(chroma_content, skew);
  const size_t map_bytes = area(half_width, half_height);
  GuardedBuffer<uint8_t> min_map(map_bytes, 0xA5, skew);
  GuardedBuffer<uint8_t> max_map(map_bytes, 0xA5, skew);
  std::vector<uint8_t> want_min(map_bytes, 0x5A);
  std::vector<uint8_t> want_max(map_bytes, 0x5A);

  xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_map.data(), max_map.data(),
                                   width, height);
  reference::max_min_nv21(luma_content.data(), chroma_content.data(), want_min.data(),
                          want_max.data(), width, height);

  EXPECT_TRUE(bytes_match(min_map, want_min,
                          {{"min, width", width}, {"height", height}, {"row", half_width}}));
  EXPECT_TRUE(bytes_match(max_map, want_max,
                          {{"max, width", width}, {"height", height}, {"row", half_width}}));
  EXPECT_TRUE(bytes_match(luma, luma_content));
  EXPECT_TRUE(bytes_match(chroma, chroma_content));
}

TEST(MaxMinNv21, NeutralChromaGivesLuma) {
  expect_uniform(0, 128, 128, 0, 0);
  expect_uniform(255, 128, 128, 255, 255);
  expect_uniform(77, 128, 128, 77, 77);
}

TEST(MaxMinNv21, ClampsFromBelow) { expect_uniform(0, 255, 0, 0, 178); }

TEST(MaxMinNv21, ClampsFromAbove) { expect_uniform(255, 0, 255, 75, 255); }

TEST(MaxMinNv21, RoundsHalfUp) { expect_uniform(100, 128, 129, 100, 102); }

// Rows run over Cb and columns over Y; one call per Cr.
TEST(MaxMinNv21, EveryTripleOfYCrCb) {
  constexpr int kHalf = 256;
  constexpr int kSize = 2 * kHalf;
  std::vector<uint8_t> luma(area(kSize, kSize));
  // Luma beside the sampled positions is the complement, which no sample may pick up.
  for (int y = 0; y < kSize; ++y)
    for (int x = 0; x < kSize; ++x)
      luma[area(y, kSize) + static_cast<size_t>(x)] =
          static_cast<uint8_t>(x % 2 == 0 && y % 2 == 0 ? x / 2 : 255 - x / 2);
  std::vector<uint8_t> chroma(area(kSize, kHalf));
  std::vector<uint8_t> min_map(area(kHalf, kHalf));
  std::vector<uint8_t> max_map(min_map.size());
  std::vector<uint8_t> want_min(min_map.size());
  std::vector<uint8_t> want_max(min_map.size());
  for (int cr = 0; cr < 256; ++cr) {
    for (int cb = 0; cb < kHalf; ++cb)
      for (int k = 0; k < kHalf; ++k) {
        const size_t at = area(cb, kHalf) + static_cast<size_t>(k);
        chroma[2 * at] = static_cast<uint8_t>(cr);
        chroma[2 * at + 1] = static_cast<uint8_t>(cb);
        const reference::MaxMin sample = reference::max_min_of_sample(k, cr, cb);
        want_min[at] = sample.min;
        want_max[at] = sample.max;
        min_map[at] = static_cast<uint8_t>(~sample.min);
        max_map[at] = static_cast<uint8_t>(~sample.max);
      }
    xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_map.data(), max_map.data(),
                                     kSize, kSize);
    ASSERT_TRUE(bytes_match(min_map, want_min, {{"min, cr", cr}, {"row", kHalf}}));
    ASSERT_TRUE(bytes_match(max_map, want_max, {{"max, cr", cr}, {"row", kHalf}}));
  }
}

TEST(MaxMinNv21, HalfWidths8And9And15And16) {
  Random random(test_seed());
  for (const int half_width : {8, 9, 15, 16})
    for (const Mood mood : kMoods) compare_frame(random, mood, Mood::kNoise, 2 * half_width, 6);
}

TEST(MaxMinNv21, EveryTailLength) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 40; ++half_width)
    for (const Mood luma_mood : kMoods)
      for (const Mood chroma_mood : {Mood::kNoise, Mood::kBlocks, Mood::kNearMaximum})
        compare_frame(random, luma_mood, chroma_mood, 2 * half_width, 2 * random.between(1, 4));
}

TEST(MaxMinNv21, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew)
    compare_frame(random, Mood::kNoise, Mood::kNoise, 2 * random.between(1, 40), 4, skew);
}

TEST(MaxMinNv21, FrameSizes) {
  Random random(test_seed());
  compare_frame(random, Mood::kGradient, Mood::kNoise, 128, 128);
  compare_frame(random, Mood::kNoise, Mood::kBlocks, 130, 130);
  compare_frame(random, Mood::kBlocks, Mood::kNoise, 1278, 718);
  compare_frame(random, Mood::kNoise, Mood::kNoise, 1280, 720);
}

// An odd height has a last luma row without chroma; half heights truncate.
TEST(MaxMinNv21, OddHeightLeavesOutTheLastRow) {
  Random random(test_seed());
  for (const int height : {1, 3, 5}) compare_frame(random, Mood::kNoise, Mood::kNoise, 34, height);
}

// Read positions run on from row to row; for odd widths they fall one byte behind in each.
TEST(MaxMinNv21, OddWidthsDrift) {
  Random random(test_seed());
  for (const int width : {1, 3, 17, 33, 35, 81})
    compare_frame(random, Mood::kNoise, Mood::kNoise, width, 6);
}

TEST(MaxMinNv21, OddLumaRowsAndColumnsDoNotMatter) {
  constexpr int kWidth = 46;
  constexpr int kHeight = 8;
  Random random(test_seed());
  std::vector<uint8_t> luma = make_image(random, Mood::kNoise, kWidth, kHeight);
  std::vector<uint8_t> chroma = make_image(random, Mood::kNoise, kWidth, kHeight / 2);
  const size_t map_bytes = area(kWidth / 2, kHeight / 2);
  std::vector<uint8_t> min_map(map_bytes, 1);
  std::vector<uint8_t> max_map(map_bytes, 2);
  xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_map.data(), max_map.data(),
                                   kWidth, kHeight);
  for (int y = 0; y < kHeight; ++y)
    for (int x = 0; x < kWidth; ++x)
      if (y % 2 == 1 || x % 2 == 1) luma[area(y, kWidth) + static_cast<size_t>(x)] = random.byte();
  std::vector<uint8_t> min_again(map_bytes, 3);
  std::vector<uint8_t> max_again(map_bytes, 4);
  xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_again.data(), max_again.data(),
                                   kWidth, kHeight);
  EXPECT_TRUE(bytes_match(min_again, min_map));
  EXPECT_TRUE(bytes_match(max_again, max_map));
}

// The last luma row that matters is an even one: nothing past its end may be read.
TEST(MaxMinNv21, ReadsNothingPastTheLastRows) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 40; ++half_width) {
    const int width = 2 * half_width;
    PageEndBuffer<uint8_t> luma(make_image(random, Mood::kNoise, width, 3));
    PageEndBuffer<uint8_t> chroma(make_image(random, Mood::kNoise, width, 2));
    PageEndBuffer<uint8_t> min_map(area(half_width, 2));
    PageEndBuffer<uint8_t> max_map(area(half_width, 2));
    xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_map.data(), max_map.data(),
                                     width, 4);
    std::vector<uint8_t> want_min(area(half_width, 2));
    std::vector<uint8_t> want_max(area(half_width, 2));
    reference::max_min_nv21(luma.data(), chroma.data(), want_min.data(), want_max.data(), width, 4);
    EXPECT_TRUE(bytes_match(min_map, want_min, {{"half width", half_width}}));
    EXPECT_TRUE(bytes_match(max_map, want_max, {{"half width", half_width}}));
  }
}

TEST(MaxMinNv21, EmptySizesWriteNothing) {
  std::vector<uint8_t> luma(64, 200);
  std::vector<uint8_t> chroma(64, 90);
  const int sizes[][2] = {{0, 0},   {0, 4},   {4, 0},     {1, 4},        {4, 1},
                          {-2, 4},  {4, -2},  {-4, -4},   {-8, -8},      {-1, -1},
                          {16, -1}, {-16, 1}, {-1280, 4}, {INT_MIN, 16}, {16, INT_MIN}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> min_map(64, 0xA5);
    GuardedBuffer<uint8_t> max_map(64, 0x5A);
    xYCrCb2BGRMaxMinPreviewNeon_NV21(luma.data(), chroma.data(), min_map.data(), max_map.data(),
                                     size[0], size[1]);
    EXPECT_TRUE(all_bytes_are(min_map, 0xA5, {{"width", size[0]}, {"height", size[1]}}));
    EXPECT_TRUE(all_bytes_are(max_map, 0x5A, {{"width", size[0]}, {"height", size[1]}}));
  }
}

}  // namespace
}  // namespace haze::test
