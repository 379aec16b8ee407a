// The threaded application of a slot's tables, and what calls outside the limits leave alone.
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
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
using reference::kTableEntries;
using reference::MapRows;
using reference::SlotTables;

MapRows all_rows(int height) { return {0, height / 2}; }

void fill_slot(int slot, uint8_t* frame, uint8_t* codes, int width, int height) {
  gCalRemoveSrcPreview[slot] = frame;
  gCalRemoveScalePreview[slot] = codes;
  gCalRemoveWPreview = width;
  gCalRemoveHPreview = height;
}

void run_stripe(int slot, int stripe) {
  int code = slot * 10 + stripe;
  EXPECT_EQ(CalRemoveThreadPreview(&code), nullptr);
  EXPECT_EQ(code, slot * 10 + stripe);
}

// A column of blocks for each code; those of 160 and above leave theirs.
TEST(TableApplication, EveryCode) {
  constexpr int kWidth = 512;
  constexpr int kHeight = 64;
  Random random(test_seed());
  const SlotTables tables = odd_tables(random);
  put(7, tables);
  const Bytes8 frame = make_frame(random, Mood::kNoise, Colours::kWild, kWidth, kHeight);
  Bytes8 codes;
  for (int i = 0; i < kWidth / 2 * kHeight / 2; ++i) codes.push_back(static_cast<uint8_t>(i));
  Bytes8 want = frame;
  reference::apply_tables(want.data(), codes.data(), tables, kWidth, kHeight, all_rows(kHeight));
  GuardedBuffer<uint8_t> actual(frame);
  CalculateRemovePreview(actual.data(), codes.data(), kWidth, kHeight, 7);
  EXPECT_TRUE(bytes_match(actual, want, {{"row", kWidth}}));
  for (size_t i = 0; i < frame.size(); ++i) {
    if (i % kWidth / 2 >= reference::kTableCodes) {
      ASSERT_EQ(actual[i], frame[i]) << i;
    }
  }
}

// The application alone, with tables that a caller has filled: the low byte of an entry counts.
TEST(TableApplication, HandFilledTables) {
  Random random(test_seed());
  for (const int slot : {3, 7, 0, 1, 6, 5, 2, 4}) {
    const SlotTables tables = odd_tables(random);
    put(slot, tables);
    const int width = 2 * random.between(1, 40);
    const int height = 2 * random.between(1, 60);
    const Bytes8 frame = make_frame(random, Mood::kNoise, Colours::kWild, width, height);
    const Bytes8 codes = random_codes(random, width, height, 0, 165);
    Bytes8 want = frame;
    reference::apply_tables(want.data(), codes.data(), tables, width, height, all_rows(height));
    GuardedBuffer<uint8_t> threaded(frame);
    GuardedBuffer<uint8_t> map(codes);
    CalculateRemovePreview(threaded.data(), map.data(), width, height, slot);
    EXPECT_TRUE(bytes_match(
        threaded, want, {{"width", width}, {"height", height}, {"slot", slot}, {"row", width}}));
    // The same stripes one after the other, last one first.
    GuardedBuffer<uint8_t> sequential(frame);
    fill_slot(slot, sequential.data(), map.data(), width, height);
    for (int stripe = 7; stripe >= 0; --stripe) run_stripe(slot, stripe);
    EXPECT_TRUE(bytes_match(sequential, want, {{"slot", slot}}));
    EXPECT_TRUE(slot_holds(slot, tables));
    EXPECT_TRUE(bytes_match(map, codes));
  }
}

// The bytes that one stripe rewrites, seen with tables that flip every bit.
void expect_stripe(int width, int height, int stripe) {
  const int slot = (height / 2 + stripe) % 8;
  SlotTables tables;
  for (int i = 0; i < kTableEntries; ++i) tables.luma.push_back(static_cast<uint32_t>(~i));
  tables.v = tables.luma;
  tables.u = tables.luma;
  put(slot, tables);
  const Bytes8 content(static_cast<size_t>(width * height * 3 / 2), 0x11);
  Bytes8 codes(static_cast<size_t>(width * height / 4), 0);
  GuardedBuffer<uint8_t> frame(content);
  fill_slot(slot, frame.data(), codes.data(), width, height);
  run_stripe(slot, stripe);
  Bytes8 want = content;
  reference::apply_tables(want.data(), codes.data(), tables, width, height,
                          reference::recovery_stripe(height, stripe));
  EXPECT_TRUE(bytes_match(frame, want, {{"height", height}, {"stripe", stripe}, {"row", width}}));
}

void expect_rows(int height, int stripe, int first_luma_row, int luma_rows) {
  const MapRows rows = reference::recovery_stripe(height, stripe);
  EXPECT_EQ(2 * rows.first, first_luma_row);
  EXPECT_EQ(2 * rows.count, luma_rows);
}

TEST(TableApplicationWorker, StripesOfHeight64) {
  for (int stripe = 0; stripe < 8; ++stripe) {
    expect_rows(64, stripe, 8 * stripe, 8);
    expect_stripe(6, 64, stripe);
  }
}

TEST(TableApplicationWorker, StripesOfHeight40) {
  for (int stripe = 0; stripe < 7; ++stripe) expect_rows(40, stripe, 4 * stripe, 4);
  expect_rows(40, 7, 28, 12);
  for (int stripe = 0; stripe < 8; ++stripe) expect_stripe(6, 40, stripe);
}

TEST(TableApplicationWorker, StripesOfHeight12) {
  for (int stripe = 0; stripe < 7; ++stripe) expect_rows(12, stripe, 0, 0);
  expect_rows(12, 7, 0, 12);
  for (int stripe = 0; stripe < 8; ++stripe) expect_stripe(6, 12, stripe);
}

TEST(TableApplicationWorker, EveryStripeOfHeightsUpTo80) {
  for (int height = 2; height <= 80; height += 2)
    for (int stripe = 0; stripe < 8; ++stripe) expect_stripe(4, height, stripe);
}

// Everything that a call outside the limits could change.
class Untouched {
 public:
  Untouched() {
    Random random(test_seed());
    for (int slot = 0; slot < 8; ++slot) {
      put(slot, odd_tables(random));
      fill_slot(slot, frame_.data() + 200, codes_.data() + 100, 8, 32);
    }
    tables_ = {all(gTable1), all(gTable2), all(gTable3)};
  }

  uint8_t* frame() { return frame_.data() + 200; }
  uint8_t* codes() { return codes_.data() + 100; }

  void check(int number) {
    EXPECT_TRUE(all_bytes_are(frame_, 60, {{"number", number}}));
    EXPECT_TRUE(all_bytes_are(codes_, 99, {{"number", number}}));
    EXPECT_EQ(gCalRemoveWPreview, 8) << number;
    EXPECT_EQ(gCalRemoveHPreview, 32) << number;
    for (int slot = 0; slot < 8; ++slot) {
      EXPECT_EQ(gCalRemoveSrcPreview[slot], frame()) << number;
      EXPECT_EQ(gCalRemoveScalePreview[slot], codes()) << number;
    }
    EXPECT_TRUE(all(gTable1) == tables_[0] && all(gTable2) == tables_[1] &&
                all(gTable3) == tables_[2])
        << number;
  }

 private:
  static std::vector<unsigned> all(const unsigned (&table)[8 * kTableEntries]) {
    return {table, table + 8 * kTableEntries};
  }

  GuardedBuffer<uint8_t> frame_{600, 60};
  GuardedBuffer<uint8_t> codes_{300, 99};
  std::vector<std::vector<unsigned>> tables_;
};

TEST(TableApplication, OtherSlotsTouchNothing) {
  Untouched state;
  Light light = grey_light(50);
  for (const int slot : {-1, 8, 100, INT_MAX, INT_MIN, -10, 214748365}) {
    // Arguments of their own, so that stored ones would show.
    Bytes8 frame(24, 60);
    Bytes8 codes(4, 99);
    HazeRemoving3Preview2_NV21(frame.data(), codes.data(), light.data(), 4, 4, slot);
    CalculateRemovePreview(frame.data(), codes.data(), 4, 4, slot);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"slot", slot}}));
    state.check(slot);
  }
}

TEST(TableApplicationWorker, OtherCodesTouchNothing) {
  Untouched state;
  for (int code : {-1, -7, -10, -13, 8, 9, 18, 79, 80, 87, 100, INT_MAX, INT_MIN}) {
    EXPECT_EQ(CalRemoveThreadPreview(&code), nullptr);
    state.check(code);
  }
}

TEST(TableApplication, EmptySizesWriteNothing) {
  Light light = grey_light(100);
  Bytes8 codes(256, 40);
  const int sizes[][2] = {{0, 0},   {0, 2},       {2, 0},       {-2, 2},  {2, -2},  {-2, -2},
                          {-8, -8}, {INT_MIN, 2}, {2, INT_MIN}, {-16, 4}, {4, -16}, {-4, -64}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> frame(1200, 60);
    uint8_t* const middle = frame.data() + 600;
    HazeRemoving3Preview2_NV21(middle, codes.data() + 128, light.data(), size[0], size[1], 2);
    CalculateRemovePreview(middle, codes.data() + 128, size[0], size[1], 2);
    fill_slot(2, middle, codes.data() + 128, size[0], size[1]);
    for (int stripe = 0; stripe < 8; ++stripe) run_stripe(2, stripe);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

}  // namespace
}  // namespace haze::test
