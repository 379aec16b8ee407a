// The square minimum filter by four threads: row stripes, then column stripes with a histogram
// each.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/channel_maps.h"
#include "tests/reference/min_filter.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/stripe_workers.h"

namespace haze::test {
namespace {

constexpr uint8_t kUnwritten = 0xA5;
constexpr int kStripes = 4;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

// Columns are split as rows are.
reference::ImageRows stripe_of(int size, int stripe) {
  return reference::even_stripe_rows(size, kStripes, stripe);
}

std::vector<unsigned> all_counters() {
  return std::vector<unsigned>(gHistPreview, gHistPreview + 8 * 4 * 256);
}

void fill_counters(unsigned value) {
  for (unsigned& counter : gHistPreview) counter = value;
}

void put_counters(std::vector<unsigned>& counters, int slot, int stripe,
                  const std::vector<int>& bins) {
  for (size_t v = 0; v < 256; ++v)
    counters[static_cast<size_t>((slot * 4 + stripe) * 256) + v] = static_cast<unsigned>(bins[v]);
}

struct Globals {
  std::array<uint8_t*, kSlotCount> src;
  std::array<uint8_t*, kSlotCount> dst;
  std::array<int, 3> sizes;

  static Globals now() {
    Globals globals = {};
    for (size_t slot = 0; slot < kSlotCount; ++slot) {
      globals.src[slot] = gCalDCSrcPreview[slot];
      globals.dst[slot] = gCalDCDstPreview[slot];
    }
    globals.sizes = {gCalDCWPreview, gCalDCHPreview, gCalDCRPreview};
    return globals;
  }
  bool operator==(const Globals& other) const {
    return src == other.src && dst == other.dst && sizes == other.sizes;
  }
};

void fill_slot(int slot, uint8_t* src, uint8_t* dst, int width, int height, int radius) {
  gCalDCSrcPreview[slot] = src;
  gCalDCDstPreview[slot] = dst;
  gCalDCWPreview = width;
  gCalDCHPreview = height;
  gCalDCRPreview = radius;
}

void compare(const std::vector<uint8_t>& content, int width, int height, int radius, int slot,
             size_t skew = 0) {
  const std::vector<uint8_t> want =
      reference::square_minimum(content.data(), width, height, radius);
  GuardedBuffer<uint8_t> src(content, skew);
  GuardedBuffer<uint8_t> dst(content.size(), kUnwritten, skew);
  // The bins are overwritten.
  GuardedBuffer<int> histogram(256, 0x3C);
  CalculateDarkChannel_MultiThreadPreview(src.data(), dst.data(), histogram.data(), width, height,
                                          radius, slot);
  ASSERT_TRUE(bytes_match(
      dst, want,
      {{"width", width}, {"height", height}, {"radius", radius}, {"slot", slot}, {"row", width}}));
  ASSERT_EQ(std::vector<int>(histogram.data(), histogram.data() + 256),
            reference::histogram_of(want.data(), width * height))
      << width << " x " << height << ", radius " << radius << ", slot " << slot;
  ASSERT_TRUE(bytes_match(src, content));
}

TEST(ThreadedDarkChannel, EveryRadiusAroundItsSmallestSize) {
  Random random(test_seed());
  for (int radius = 0; radius <= 20; ++radius)
    for (int extra = -1; extra <= 1; ++extra) {
      const int width = std::max(2 * radius + 1 + extra, 1);
      const int height = std::max(2 * radius + 1 - extra, 1);
      compare(make_image(random, random.one_of(kMoods), width, height), width, height, radius,
              random.between(0, 7));
    }
}

// Below 8 rows or columns one worker does the whole pass.
TEST(ThreadedDarkChannel, EverySideUpTo40) {
  Random random(test_seed());
  for (int side = 1; side <= 40; ++side) {
    const int other = random.between(1, 40);
    compare(make_image(random, Mood::kNoise, side, other), side, other, random.between(0, 20),
            side % 8);
    compare(make_image(random, random.one_of(kMoods), other, side), other, side,
            random.between(0, 6), 7 - side % 8);
  }
}

TEST(ThreadedDarkChannel, FrameSizes) {
  Random random(test_seed());
  compare(make_image(random, Mood::kNoise, 640, 360), 640, 360, 7, 3);
  compare(make_image(random, Mood::kGradient, 1280, 720), 1280, 720, 15, 0);
  compare(make_image(random, Mood::kBlocks, 641, 359), 641, 359, 20, 7);
}

TEST(ThreadedDarkChannel, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew)
    compare(make_image(random, Mood::kNoise, 37, 23), 37, 23, random.between(0, 8), 2, skew);
}

// Few values, so that minima are tied and the row that is remembered decides when a column is
// searched again.
TEST(ThreadedDarkChannel, TiedMinima) {
  Random random(test_seed());
  for (int i = 0; i < 40; ++i) {
    const int width = random.between(1, 40);
    const int height = random.between(1, 40);
    std::vector<uint8_t> content = make_image(random, Mood::kNoise, width, height);
    for (uint8_t& sample : content) sample = static_cast<uint8_t>(sample / 100);
    compare(content, width, height, random.between(0, 5), random.between(0, 7));
  }
}

TEST(ThreadedDarkChannel, RampsInBothDirections) {
  constexpr int kSide = 48;
  for (const int radius : {0, 1, 2, 5, 13, 23, 24})
    for (int direction = 0; direction < 4; ++direction) {
      std::vector<uint8_t> content;
      for (int y = 0; y < kSide; ++y)
        for (int x = 0; x < kSide; ++x) {
          const int along_x = direction % 2 == 0 ? x : kSide - x;
          const int along_y = direction / 2 == 0 ? y : kSide - y;
          content.push_back(static_cast<uint8_t>(2 * along_x + 3 * along_y));
        }
      compare(content, kSide, kSide, radius, direction);
    }
}

TEST(ThreadedDarkChannel, RadiusBeyondTheImage) {
  Random random(test_seed());
  for (const int radius : {20, 1000, 1 << 30, INT_MAX / 2 + 1, INT_MAX})
    compare(make_image(random, Mood::kNoise, 21, 30), 21, 30, radius, 1);
}

TEST(ThreadedDarkChannel, EqualsTheSingleThread) {
  Random random(test_seed());
  for (const Mood mood : kMoods) {
    const int width = random.between(30, 100);
    const int height = random.between(30, 100);
    const int radius = random.between(0, 14);
    std::vector<uint8_t> src = make_image(random, mood, width, height);
    std::vector<uint8_t> alone(src.size(), 1);
    std::vector<uint8_t> threaded(src.size(), 2);
    std::vector<int> bins_alone(256);
    std::vector<int> bins_threaded(256, -1);
    CalculateDarkChannelPreview(src.data(), alone.data(), bins_alone.data(), width, height, radius);
    CalculateDarkChannel_MultiThreadPreview(src.data(), threaded.data(), bins_threaded.data(),
                                            width, height, radius, 4);
    EXPECT_TRUE(bytes_match(threaded, alone, {{"radius", radius}, {"row", width}}));
    EXPECT_EQ(bins_threaded, bins_alone);
  }
}

TEST(ThreadedDarkChannel, SecondCallOverwritesTheHistogram) {
  Random random(test_seed());
  std::vector<uint8_t> src = make_image(random, Mood::kNoise, 30, 20);
  std::vector<uint8_t> dst(src.size());
  std::vector<int> bins(256, 99);
  CalculateDarkChannel_MultiThreadPreview(src.data(), dst.data(), bins.data(), 30, 20, 2, 6);
  const std::vector<int> once = bins;
  EXPECT_EQ(once, reference::histogram_of(dst.data(), 600));
  CalculateDarkChannel_MultiThreadPreview(src.data(), dst.data(), bins.data(), 30, 20, 2, 6);
  EXPECT_EQ(bins, once);
}

// Arguments and histograms of other slots stay; those of the slot are left for the caller to see.
TEST(ThreadedDarkChannel, GlobalsAfterACall) {
  Random random(test_seed());
  for (const int slot : {3, 0, 7, 5, 1, 6, 2, 4}) {
    const int width = random.between(1, 40);
    const int height = random.between(1, 40);
    const int radius = random.between(0, 9);
    std::vector<uint8_t> src = make_image(random, Mood::kNoise, width, height);
    std::vector<uint8_t> dst(src.size());
    std::vector<int> bins(256);
    fill_counters(static_cast<unsigned>(70000 + slot));
    std::vector<unsigned> want_counters = all_counters();
    Globals want = Globals::now();
    CalculateDarkChannel_MultiThreadPreview(src.data(), dst.data(), bins.data(), width, height,
                                            radius, slot);
    // The second pass reads a temporary image, whose address is nothing to rely on.
    const size_t at = static_cast<size_t>(slot);
    EXPECT_NE(gCalDCSrcPreview[slot], src.data());
    want.src[at] = gCalDCSrcPreview[slot];
    want.dst[at] = dst.data();
    want.sizes = {width, height, radius};
    EXPECT_TRUE(Globals::now() == want) << "slot " << slot;
    for (int stripe = 0; stripe < kStripes; ++stripe) {
      const reference::ImageRows columns = stripe_of(width, stripe);
      put_counters(
          want_counters, slot, stripe,
          reference::histogram_of_columns(dst.data(), width, height, columns.first, columns.count));
    }
    EXPECT_TRUE(all_counters() == want_counters) << "slot " << slot << ", width " << width;
  }
}

TEST(ThreadedDarkChannel, OtherSlotsTouchNothing) {
  std::vector<uint8_t> src(area(16, 16), 70);
  fill_counters(17);
  const Globals before = Globals::now();
  for (const int slot : kSlotsOutOfRange) {
    GuardedBuffer<uint8_t> dst(src.size(), kUnwritten);
    std::vector<int> bins(256, 5);
    CalculateDarkChannel_MultiThreadPreview(src.data(), dst.data(), bins.data(), 16, 16, 2, slot);
    EXPECT_TRUE(all_bytes_are(dst, kUnwritten, {{"slot", slot}}));
    EXPECT_EQ(bins, std::vector<int>(256, 5));
    EXPECT_TRUE(Globals::now() == before) << "slot " << slot;
    EXPECT_TRUE(all_counters() == std::vector<unsigned>(8 * 4 * 256, 17)) << "slot " << slot;
  }
}

TEST(ThreadedDarkChannel, EmptySizesAndNegativeRadiiWriteNothing) {
  std::vector<uint8_t> src(2048, 70);
  const int cases[][3] = {{0, 0, 0},      {0, 16, 1},    {16, 0, 1},      {-8, 16, 1},
                          {16, -8, 1},    {-8, -8, 1},   {-8, -8, 0},     {-16, -16, 2},
                          {16, 16, -1},   {16, 16, -30}, {INT_MIN, 8, 0}, {8, INT_MIN, 0},
                          {8, 8, INT_MIN}};
  for (const auto& arguments : cases) {
    GuardedBuffer<uint8_t> dst(2048, kUnwritten);
    std::vector<int> bins(256, 5);
    CalculateDarkChannel_MultiThreadPreview(src.data() + 1024, dst.data() + 1024, bins.data(),
                                            arguments[0], arguments[1], arguments[2], 2);
    EXPECT_TRUE(all_bytes_are(
        dst, kUnwritten,
        {{"width", arguments[0]}, {"height", arguments[1]}, {"radius", arguments[2]}}));
    EXPECT_EQ(bins, std::vector<int>(256, 5));
  }
}

TEST(ThreadedDarkChannel, AllSlotsAtOnce) {
  constexpr int kWidth = 61;
  constexpr int kHeight = 53;
  constexpr int kRadius = 4;
  Random random(test_seed());
  std::vector<std::vector<uint8_t>> sources;
  std::vector<std::vector<uint8_t>> actual;
  std::vector<std::vector<int>> bins(kSlotCount, std::vector<int>(256));
  for (int slot = 0; slot < kSlotCount; ++slot) {
    sources.push_back(make_image(random, random.one_of(kMoods), kWidth, kHeight));
    actual.emplace_back(area(kWidth, kHeight), kUnwritten);
  }
  in_all_slots_at_once([&](int slot) {
    const size_t at = static_cast<size_t>(slot);
    CalculateDarkChannel_MultiThreadPreview(sources[at].data(), actual[at].data(), bins[at].data(),
                                            kWidth, kHeight, kRadius, slot);
  });
  for (size_t at = 0; at < kSlotCount; ++at) {
    const std::vector<uint8_t> want =
        reference::square_minimum(sources[at].data(), kWidth, kHeight, kRadius);
    EXPECT_TRUE(bytes_match(actual[at], want, {{"slot", at}, {"row", kWidth}}));
    EXPECT_EQ(bins[at], reference::histogram_of(want.data(), kWidth * kHeight));
  }
}

// One row stripe by hand-filled globals; rows of the others stay.
void expect_row_stripe(Random& random, int width, int height, int radius, int slot, int stripe) {
  std::vector<uint8_t> src = make_image(random, random.one_of(kMoods), width, height);
  GuardedBuffer<uint8_t> dst(src.size(), kUnwritten);
  fill_slot(slot, src.data(), dst.data(), width, height, radius);
  fill_counters(23);
  const Globals before = Globals::now();
  run_worker(CalDCThread_horPreview, slot * 10 + stripe);
  EXPECT_TRUE(Globals::now() == before);
  EXPECT_TRUE(all_counters() == std::vector<unsigned>(8 * 4 * 256, 23));
  const std::vector<uint8_t> minima = reference::row_minimum(src.data(), width, height, radius);
  std::vector<uint8_t> want(src.size(), kUnwritten);
  const reference::ImageRows rows = stripe_of(height, stripe);
  for (size_t i = area(rows.first, width); i < area(rows.first + rows.count, width); ++i)
    want[i] = minima[i];
  EXPECT_TRUE(bytes_match(dst, want,
                          {{"width", width},
                           {"height", height},
                           {"radius", radius},
                           {"stripe", stripe},
                           {"row", width}}));
}

// One column stripe; columns and counters of the others stay, its own counters start from zero.
void expect_column_stripe(Random& random, int width, int height, int radius, int slot, int stripe) {
  std::vector<uint8_t> src = make_image(random, random.one_of(kMoods), width, height);
  GuardedBuffer<uint8_t> dst(src.size(), kUnwritten);
  fill_slot(slot, src.data(), dst.data(), width, height, radius);
  fill_counters(23);
  std::vector<unsigned> want_counters = all_counters();
  const Globals before = Globals::now();
  run_worker(CalDCThread_verPreview, slot * 10 + stripe);
  EXPECT_TRUE(Globals::now() == before);
  const std::vector<uint8_t> minima = reference::column_minimum(src.data(), width, height, radius);
  std::vector<uint8_t> want(src.size(), kUnwritten);
  const reference::ImageRows columns = stripe_of(width, stripe);
  for (int y = 0; y < height; ++y)
    for (int x = columns.first; x < columns.first + columns.count; ++x) {
      const size_t at = area(y, width) + static_cast<size_t>(x);
      want[at] = minima[at];
    }
  put_counters(
      want_counters, slot, stripe,
      reference::histogram_of_columns(minima.data(), width, height, columns.first, columns.count));
  EXPECT_TRUE(bytes_match(dst, want,
                          {{"width", width},
                           {"height", height},
                           {"radius", radius},
                           {"stripe", stripe},
                           {"row", width}}));
  EXPECT_TRUE(all_counters() == want_counters) << "slot " << slot << ", stripe " << stripe;
}

TEST(DarkChannelWorkers, EveryRowStripeOfHeightsUpTo40) {
  Random random(test_seed());
  for (int height = 1; height <= 40; ++height)
    for (int stripe = 0; stripe < kStripes; ++stripe)
      expect_row_stripe(random, random.between(1, 30), height, random.between(0, 7), height % 8,
                        stripe);
}

TEST(DarkChannelWorkers, EveryColumnStripeOfWidthsUpTo40) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width)
    for (int stripe = 0; stripe < kStripes; ++stripe)
      expect_column_stripe(random, width, random.between(1, 30), random.between(0, 7), width % 8,
                           stripe);
}

TEST(DarkChannelWorkers, OtherCodesWriteNothing) {
  std::vector<uint8_t> src(area(16, 16), 70);
  GuardedBuffer<uint8_t> dst(src.size(), kUnwritten);
  for (int slot = 0; slot < kSlotCount; ++slot) fill_slot(slot, src.data(), dst.data(), 16, 16, 2);
  fill_counters(31);
  for (const int code : codes_out_of_range(kStripes)) {
    run_worker(CalDCThread_horPreview, code);
    run_worker(CalDCThread_verPreview, code);
    EXPECT_TRUE(all_bytes_are(dst, kUnwritten, {{"code", code}}));
    EXPECT_TRUE(all_counters() == std::vector<unsigned>(8 * 4 * 256, 31)) << "code " << code;
  }
}

TEST(DarkChannelWorkers, EmptySizesAndNegativeRadiiWriteNothing) {
  std::vector<uint8_t> src(2048, 70);
  const int cases[][3] = {{0, 16, 1},      {16, 0, 1},      {-8, 16, 1},
                          {16, -8, 1},     {-16, -16, 2},   {16, 16, -1},
                          {INT_MIN, 8, 0}, {8, INT_MIN, 0}, {8, 8, INT_MIN}};
  for (const auto& arguments : cases) {
    GuardedBuffer<uint8_t> dst(2048, kUnwritten);
    fill_slot(5, src.data() + 1024, dst.data() + 1024, arguments[0], arguments[1], arguments[2]);
    for (int stripe = 0; stripe < kStripes; ++stripe) {
      run_worker(CalDCThread_horPreview, 50 + stripe);
      run_worker(CalDCThread_verPreview, 50 + stripe);
    }
    EXPECT_TRUE(all_bytes_are(
        dst, kUnwritten,
        {{"width", arguments[0]}, {"height", arguments[1]}, {"radius", arguments[2]}}));
  }
}

}  // namespace
}  // namespace haze::test
