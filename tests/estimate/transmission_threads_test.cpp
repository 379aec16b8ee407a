#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/transmission.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

constexpr uint8_t kUnwritten = 0xA5;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

void compare(const std::vector<uint8_t>& means, const std::vector<uint8_t>& mins, int width,
             int height, int strength_q8, int light, int slot) {
  std::vector<uint8_t> want(means.size());
  reference::transmission_map_q8(means.data(), mins.data(), want.data(), width, height, strength_q8,
                                 light);
  GuardedBuffer<uint8_t> mean_map(means);
  GuardedBuffer<uint8_t> min_map(mins);
  GuardedBuffer<uint8_t> codes(means.size(), kUnwritten);
  CalculateTChannelPreview(mean_map.data(), min_map.data(), codes.data(), width, height,
                           strength_q8, light, slot);
  ASSERT_TRUE(bytes_match(codes, want,
                          {{"width", width},
                           {"height", height},
                           {"strengthQ8", strength_q8},
                           {"light", light},
                           {"slot", slot}}));
  ASSERT_TRUE(bytes_match(mean_map, means));
  ASSERT_TRUE(bytes_match(min_map, mins));
}

void run_stripe(int slot, int stripe) {
  int code = slot * 10 + stripe;
  EXPECT_EQ(CalTThreadPreview(&code), nullptr);
  EXPECT_EQ(code, slot * 10 + stripe);
}

// Puts arguments into the globals as a caller who runs the stripes alone does.
void fill_slot(int slot, uint8_t* means, uint8_t* mins, uint8_t* codes, int width, int height,
               int strength_q8, int light) {
  gCalTSrcPreview[slot] = means;
  gCalTSrc1Preview[slot] = mins;
  gCalTDstPreview[slot] = codes;
  gAlpha[slot] = strength_q8;
  gAA[slot] = light;
  gCalTWPreview = width;
  gCalTHPreview = height;
}

TEST(ThreadedTransmission, HeightsUpTo40InEverySlot) {
  Random random(test_seed());
  for (int height = 1; height <= 40; ++height)
    for (int slot = 0; slot < 8; slot += 1 + (height % 3)) {
      const int width = random.between(1, 30);
      compare(make_image(random, Mood::kNoise, width, height),
              make_image(random, Mood::kBlocks, width, height), width, height,
              random.between(-100, 700), random.between(0, 255), slot);
    }
}

TEST(ThreadedTransmission, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {64, 64}, {65, 65}, {320, 241}};
  for (const auto& size : sizes)
    compare(make_image(random, Mood::kGradient, size[0], size[1]),
            make_image(random, Mood::kNoise, size[0], size[1]), size[0], size[1], 600, 190, 3);
}

// Every pair (S, M): rows by S, columns by M.
TEST(ThreadedTransmission, EveryBytePairAndLight) {
  std::vector<uint8_t> means(65536);
  std::vector<uint8_t> mins(65536);
  for (size_t i = 0; i < means.size(); ++i) {
    means[i] = static_cast<uint8_t>(i / 256);
    mins[i] = static_cast<uint8_t>(i % 256);
  }
  for (int light = 0; light < 256; ++light) compare(means, mins, 256, 256, 612, light, light % 8);
  for (const int light : {0, 1, 23, 100, 255})
    for (const int strength_q8 :
         {-8000000, -256, -1, 0, 1, 256, 1531, 8000000, INT_MAX, INT_MIN, 25000001})
      compare(means, mins, 256, 256, strength_q8, light, 7);
}

TEST(ThreadedTransmission, NoLight) {
  constexpr int kWidth = 9;
  constexpr int kHeight = 20;
  const auto map_of = [](uint8_t mean, uint8_t min, int strength_q8) {
    std::vector<uint8_t> means(area(kWidth, kHeight), mean);
    std::vector<uint8_t> mins(means.size(), min);
    std::vector<uint8_t> codes(means.size(), kUnwritten);
    CalculateTChannelPreview(means.data(), mins.data(), codes.data(), kWidth, kHeight, strength_q8,
                             0, 0);
    return codes;
  };
  EXPECT_TRUE(all_bytes_are(map_of(1, 1, 256), 40));
  EXPECT_TRUE(all_bytes_are(map_of(0, 1, 256), 0));
  EXPECT_TRUE(all_bytes_are(map_of(1, 0, 256), 0));
  EXPECT_TRUE(all_bytes_are(map_of(1, 1, -256), 158));
}

TEST(ThreadedTransmission, NegativeStrengthIsClear) {
  std::vector<uint8_t> means(area(8, 16), 200);
  std::vector<uint8_t> mins(means.size(), 100);
  std::vector<uint8_t> codes(means.size(), kUnwritten);
  CalculateTChannelPreview(means.data(), mins.data(), codes.data(), 8, 16, -300, 128, 2);
  EXPECT_TRUE(all_bytes_are(codes, 158));
}

TEST(ThreadedTransmission, KeepsItsArgumentsInTheSlot) {
  for (int slot = 0; slot < 8; ++slot) {
    uint8_t* others[8];
    for (int i = 0; i < 8; ++i) others[i] = gCalTDstPreview[i];
    std::vector<uint8_t> means(area(6, 20), 10);
    std::vector<uint8_t> mins(means.size(), 20);
    std::vector<uint8_t> codes(means.size());
    CalculateTChannelPreview(means.data(), mins.data(), codes.data(), 6, 20, 300 + slot, 100 + slot,
                             slot);
    EXPECT_EQ(gCalTSrcPreview[slot], means.data());
    EXPECT_EQ(gCalTSrc1Preview[slot], mins.data());
    EXPECT_EQ(gCalTDstPreview[slot], codes.data());
    EXPECT_EQ(gAlpha[slot], 300 + slot);
    EXPECT_EQ(gAA[slot], 100 + slot);
    EXPECT_EQ(gCalTWPreview, 6);
    EXPECT_EQ(gCalTHPreview, 20);
    others[slot] = codes.data();
    for (int i = 0; i < 8; ++i) EXPECT_EQ(gCalTDstPreview[i], others[i]);
  }
}

TEST(ThreadedTransmission, OtherSlotsWriteNothing) {
  std::vector<uint8_t> map(area(16, 16), 70);
  for (const int slot : {-1, 8, 100, INT_MAX, INT_MIN, -10, 214748365}) {
    GuardedBuffer<uint8_t> codes(map.size(), kUnwritten);
    CalculateTChannelPreview(map.data(), map.data(), codes.data(), 16, 16, 256, 200, slot);
    EXPECT_TRUE(all_bytes_are(codes, kUnwritten, {{"slot", slot}}));
  }
}

TEST(ThreadedTransmission, EmptySizesWriteNothing) {
  std::vector<uint8_t> map(area(16, 64), 70);
  const int sizes[][2] = {{0, 0},     {0, 16},       {16, 0},       {-1, 16},
                          {16, -1},   {16, -8},      {16, -20},     {-16, -8},
                          {-16, -20}, {INT_MIN, 16}, {16, INT_MIN}, {-4, -64}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> codes(map.size(), kUnwritten);
    uint8_t* const middle = codes.data() + 512;
    CalculateTChannelPreview(map.data(), map.data(), middle, size[0], size[1], 256, 200, 1);
    EXPECT_TRUE(all_bytes_are(codes, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
  }
}

// The rows that a stripe writes, seen by the bytes that it leaves.
void expect_stripe(int width, int height, int slot, int stripe) {
  std::vector<uint8_t> means(area(width, height), 100);
  std::vector<uint8_t> mins(means.size(), 255);
  GuardedBuffer<uint8_t> codes(means.size(), kUnwritten);
  fill_slot(slot, means.data(), mins.data(), codes.data(), width, height, 256, 200);
  run_stripe(slot, stripe);
  const reference::StripeRows rows = reference::transmission_stripe(height, stripe);
  std::vector<uint8_t> want(means.size(), kUnwritten);
  for (int y = rows.first; y < rows.first + rows.count; ++y)
    for (int x = 0; x < width; ++x) want[area(y, width) + static_cast<size_t>(x)] = 60;
  EXPECT_TRUE(bytes_match(codes, want, {{"height", height}, {"stripe", stripe}, {"row", width}}));
}

TEST(TransmissionWorker, StripesOfHeight20) {
  for (int stripe = 0; stripe < 7; ++stripe) {
    EXPECT_EQ(reference::transmission_stripe(20, stripe).first, 2 * stripe);
    EXPECT_EQ(reference::transmission_stripe(20, stripe).count, 2);
  }
  EXPECT_EQ(reference::transmission_stripe(20, 7).first, 14);
  EXPECT_EQ(reference::transmission_stripe(20, 7).count, 6);
  for (int stripe = 0; stripe < 8; ++stripe) expect_stripe(5, 20, 0, stripe);
}

TEST(TransmissionWorker, StripesOfHeight7) {
  for (int stripe = 0; stripe < 7; ++stripe)
    EXPECT_EQ(reference::transmission_stripe(7, stripe).count, 0);
  EXPECT_EQ(reference::transmission_stripe(7, 7).count, 7);
  for (int stripe = 0; stripe < 8; ++stripe) expect_stripe(5, 7, 0, stripe);
}

TEST(TransmissionWorker, EveryStripeOfHeightsUpTo40) {
  for (int height = 1; height <= 40; ++height)
    for (int stripe = 0; stripe < 8; ++stripe) expect_stripe(3, height, height % 8, stripe);
}

TEST(TransmissionWorker, HandFilledSlots) {
  Random random(test_seed());
  for (int slot = 0; slot < 8; ++slot) {
    const int width = random.between(1, 20);
    const int height = random.between(1, 60);
    const int strength_q8 = random.between(-100, 900);
    const int light = slot == 3 ? 0 : random.between(1, 255);
    std::vector<uint8_t> means = make_image(random, Mood::kNoise, width, height);
    std::vector<uint8_t> mins = make_image(random, Mood::kNoise, width, height);
    std::vector<uint8_t> codes(means.size(), kUnwritten);
    std::vector<uint8_t> want(means.size());
    reference::transmission_map_q8(means.data(), mins.data(), want.data(), width, height,
                                   strength_q8, light);
    fill_slot(slot, means.data(), mins.data(), codes.data(), width, height, strength_q8, light);
    for (int stripe = 7; stripe >= 0; --stripe) run_stripe(slot, stripe);
    EXPECT_TRUE(bytes_match(codes, want, {{"slot", slot}, {"light", light}, {"row", width}}));
  }
}

TEST(TransmissionWorker, OtherCodesAndEmptySizesWriteNothing) {
  std::vector<uint8_t> map(area(16, 64), 70);
  GuardedBuffer<uint8_t> codes(map.size(), kUnwritten);
  uint8_t* const middle = codes.data() + 512;
  for (int slot = 0; slot < 8; ++slot)
    fill_slot(slot, map.data(), map.data(), middle, 8, 16, 256, 200);
  for (int code : {-1, -7, -10, 8, 9, 18, 79, 80, 87, 100, INT_MAX, INT_MIN}) {
    EXPECT_EQ(CalTThreadPreview(&code), nullptr);
    EXPECT_TRUE(all_bytes_are(codes, kUnwritten, {{"code", code}}));
  }
  const int sizes[][2] = {{0, 16}, {16, 0}, {-1, 16}, {16, -1}, {8, -8}, {-8, -20}, {-4, -64}};
  for (const auto& size : sizes) {
    fill_slot(2, map.data(), map.data(), middle, size[0], size[1], 256, 200);
    for (int stripe = 0; stripe < 8; ++stripe) run_stripe(2, stripe);
    EXPECT_TRUE(all_bytes_are(codes, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
  }
}

}  // namespace
}  // namespace haze::test
