#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/recovery_variants.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"
#include "tests/support/slot_tables.h"

namespace haze::test {
namespace {

using Bytes8 = std::vector<uint8_t>;
using reference::MapRows;
using reference::SlotTables;

// Builds the tables of a slot; the frame hardly matters.
void build(int slot, Light light) {
  uint8_t frame[6] = {10, 20, 30, 40, 50, 60};
  uint8_t codes[1] = {158};
  HazeRemoving3Preview2_NV21(frame, codes, light.data(), 2, 2, slot);
}

MapRows all_rows(int height) { return {0, height / 2}; }

void compare(const Bytes8& frame, const Bytes8& codes, const Light& light, int width, int height,
             int slot) {
  Bytes8 want = frame;
  const SlotTables tables = reference::slot_tables(light.data());
  reference::apply_tables(want.data(), codes.data(), tables, width, height, all_rows(height));
  GuardedBuffer<uint8_t> actual(frame);
  GuardedBuffer<uint8_t> map(codes);
  GuardedBuffer<uint8_t> light_bgr(Bytes8(light.begin(), light.end()));
  HazeRemoving3Preview2_NV21(actual.data(), map.data(), light_bgr.data(), width, height, slot);
  ASSERT_TRUE(bytes_match(actual, want,
                          {{"width", width}, {"height", height}, {"slot", slot}, {"row", width}}));
  ASSERT_TRUE(bytes_match(map, codes));
  ASSERT_TRUE(bytes_match(light_bgr, light));
  ASSERT_TRUE(slot_holds(slot, tables));
}

TEST(SlotTablesReference, EqualTheFrameRecovery) {
  Random random(test_seed());
  const Bytes8 frame = make_frame(random, Mood::kNoise, Colours::kWild, 64, 48);
  const Bytes8 codes = random_codes(random, 64, 48, 0, 159);
  const Light light = {90, 180, 200};
  Bytes8 by_tables = frame;
  Bytes8 by_formula = frame;
  reference::apply_tables(by_tables.data(), codes.data(), reference::slot_tables(light.data()), 64,
                          48, all_rows(48));
  reference::recover_nv21(by_formula.data(), codes.data(), light.data(), 64, 48);
  EXPECT_TRUE(bytes_match(by_tables, by_formula));
}

TEST(SlotTables, EqualTheFrameRecovery) {
  Random random(test_seed());
  for (int i = 0; i < 12; ++i) {
    const int width = 2 * random.between(1, 80);
    const int height = 2 * random.between(1, 80);
    const Bytes8 frame = make_frame(random, random.one_of(kMoods), Colours::kWild, width, height);
    Bytes8 codes = random_codes(random, width, height, 0, 159);
    Light light = random_light(random);
    Bytes8 by_tables = frame;
    Bytes8 by_formula = frame;
    HazeRemoving3Preview2_NV21(by_tables.data(), codes.data(), light.data(), width, height, i % 8);
    HazeRemoving3Preview_NV21(by_formula.data(), codes.data(), light.data(), width, height, 0);
    EXPECT_TRUE(
        bytes_match(by_tables, by_formula, {{"width", width}, {"height", height}, {"row", width}}));
  }
}

// Every code and value for every grey light, in four parts that may run side by side.
class SlotTablesOfGreyLights : public ::testing::TestWithParam<int> {};

INSTANTIATE_TEST_SUITE_P(Quarters, SlotTablesOfGreyLights, ::testing::Values(0, 1, 2, 3));

TEST_P(SlotTablesOfGreyLights, HoldEveryCodeAndValue) {
  const std::vector<uint32_t> neutral = reference::chroma_table(128);
  for (int a = GetParam(); a < 256; a += 4) {
    const Light light = grey_light(a);
    const int slot = a / 4 % 8;
    build(slot, light);
    ASSERT_TRUE(
        holds(gTable1, slot, reference::luma_table(reference::light_to_yuv(light.data()).y)));
    ASSERT_TRUE(holds(gTable2, slot, neutral));
    ASSERT_TRUE(holds(gTable3, slot, neutral));
  }
}

TEST(SlotTables, ColouredLightsHoldEveryCodeAndValue) {
  Random random(test_seed());
  std::vector<Light> lights = {{255, 0, 0},   {0, 255, 0},   {0, 0, 255},
                               {0, 255, 255}, {255, 0, 255}, {255, 255, 0}};
  for (int i = 0; i < 20; ++i) lights.push_back(random_light(random));
  for (const Light& light : lights) {
    const int slot = random.between(0, 7);
    build(slot, light);
    ASSERT_TRUE(slot_holds(slot, reference::slot_tables(light.data())));
  }
}

TEST(SlotTables, SlotsKeepTheirOwnLights) {
  const Light first = {100, 120, 140};
  const Light second = {200, 190, 180};
  build(0, first);
  ASSERT_TRUE(slot_holds(0, reference::slot_tables(first.data())));
  build(1, second);
  EXPECT_TRUE(slot_holds(1, reference::slot_tables(second.data())));
  EXPECT_TRUE(slot_holds(0, reference::slot_tables(first.data())));
}

TEST(SlotTables, AnySlotInAnyOrderTouchesNoOther) {
  Random random(test_seed());
  SlotTables wanted[8];
  for (int slot = 0; slot < 8; ++slot) {
    wanted[slot] = odd_tables(random);
    put(slot, wanted[slot]);
  }
  for (const int slot : {5, 0, 7, 2, 6, 1, 4, 3, 7, 0}) {
    const Light light = random_light(random);
    build(slot, light);
    wanted[slot] = reference::slot_tables(light.data());
    for (int other = 0; other < 8; ++other) ASSERT_TRUE(slot_holds(other, wanted[other]));
  }
}

TEST(SlotTables, KeepTheirArgumentsInTheSlot) {
  Random random(test_seed());
  for (int slot = 7; slot >= 0; --slot) {
    uint8_t* sources[8];
    uint8_t* maps[8];
    std::copy(gCalRemoveSrcPreview, gCalRemoveSrcPreview + 8, sources);
    std::copy(gCalRemoveScalePreview, gCalRemoveScalePreview + 8, maps);
    const int width = 2 * random.between(1, 20);
    Bytes8 frame = make_frame(random, Mood::kNoise, Colours::kWild, width, 12);
    Bytes8 codes = random_codes(random, width, 12, 0, 159);
    Light light = random_light(random);
    HazeRemoving3Preview2_NV21(frame.data(), codes.data(), light.data(), width, 12, slot);
    sources[slot] = frame.data();
    maps[slot] = codes.data();
    EXPECT_TRUE(std::equal(sources, sources + 8, gCalRemoveSrcPreview));
    EXPECT_TRUE(std::equal(maps, maps + 8, gCalRemoveScalePreview));
    EXPECT_EQ(gCalRemoveWPreview, width);
    EXPECT_EQ(gCalRemoveHPreview, 12);
    gCalRemoveSrcPreview[slot] = nullptr;
    CalculateRemovePreview(frame.data(), codes.data(), width, 10, slot);
    EXPECT_TRUE(std::equal(sources, sources + 8, gCalRemoveSrcPreview));
    EXPECT_EQ(gCalRemoveHPreview, 10);
  }
}

TEST(SlotTables, SizesUpTo40InEverySlot) {
  Random random(test_seed());
  for (int half = 1; half <= 20; ++half) {
    const int other = 2 * random.between(1, 20);
    const Mood mood = random.one_of(kMoods);
    const Light light = random_light(random);
    compare(make_frame(random, mood, Colours::kWild, 2 * half, other),
            random_codes(random, 2 * half, other, 0, 159), light, 2 * half, other, half % 8);
    compare(make_frame(random, mood, Colours::kWild, other, 2 * half),
            random_codes(random, other, 2 * half, 0, 159), light, other, 2 * half, 7 - half % 8);
  }
}

TEST(SlotTables, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {2, 720}, {1280, 2}};
  for (const auto& size : sizes)
    compare(make_hazy_frame(random, size[0], size[1]),
            random_codes(random, size[0], size[1], 40, 158), random_light(random), size[0], size[1],
            3);
}

TEST(SlotTables, CodesOf160AndAboveLeaveTheirBlock) {
  Random random(test_seed());
  for (int i = 0; i < 6; ++i)
    compare(make_frame(random, Mood::kNoise, Colours::kWild, 66, 34),
            random_codes(random, 66, 34, 120, 255), random_light(random), 66, 34, i);
}

TEST(SlotTables, TouchNothingPastTheFrame) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 20; ++half_width) {
    const int width = 2 * half_width;
    const Bytes8 content = make_frame(random, Mood::kNoise, Colours::kWild, width, 6);
    PageEndBuffer<uint8_t> frame(content);
    PageEndBuffer<uint8_t> codes(random_codes(random, width, 6, 0, 159));
    PageEndBuffer<uint8_t> light(Bytes8{90, 180, 200});
    Bytes8 want = content;
    reference::recover_nv21(want.data(), codes.data(), light.data(), width, 6);
    HazeRemoving3Preview2_NV21(frame.data(), codes.data(), light.data(), width, 6, 4);
    EXPECT_TRUE(bytes_match(frame, want, {{"width", width}}));
  }
}

}  // namespace
}  // namespace haze::test
