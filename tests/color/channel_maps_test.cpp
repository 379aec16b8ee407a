#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/channel_maps.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/stripe_workers.h"

namespace haze::test {
namespace {

constexpr uint8_t kUnwritten = 0xA5;
constexpr int kMaxMinStripes = 8;
constexpr int kMinStripes = 4;

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

struct Maps {
  std::vector<uint8_t> min;
  std::vector<uint8_t> max;
};

Maps reference_maps(const std::vector<uint8_t>& src, int width, int height) {
  Maps maps = {std::vector<uint8_t>(area(width, height)),
               std::vector<uint8_t>(area(width, height))};
  reference::channel_maps(src.data(), maps.min.data(), maps.max.data(), width,
                          reference::all_rows(height));
  return maps;
}

// Argument globals of both families.
struct Globals {
  std::array<std::array<uint8_t*, kSlotCount>, 5> pointers;
  std::array<int, 4> sizes;

  static Globals now() {
    Globals globals = {};
    uint8_t** const arrays[] = {gCalMCSrcPreview, gCalMCDstPreview, gCalMaxMinSrcPreview,
                                gCalMaxMinDstMinPreview, gCalMaxMinDstMaxPreview};
    for (size_t i = 0; i < 5; ++i)
      for (size_t slot = 0; slot < kSlotCount; ++slot) globals.pointers[i][slot] = arrays[i][slot];
    globals.sizes = {gCalMCWPreview, gCalMCHPreview, gCalMaxMinWPreview, gCalMaxMinHPreview};
    return globals;
  }
  bool operator==(const Globals& other) const {
    return pointers == other.pointers && sizes == other.sizes;
  }
};

void fill_max_min_slot(int slot, uint8_t* src, uint8_t* min_map, uint8_t* max_map, int width,
                       int height) {
  gCalMaxMinSrcPreview[slot] = src;
  gCalMaxMinDstMinPreview[slot] = min_map;
  gCalMaxMinDstMaxPreview[slot] = max_map;
  gCalMaxMinWPreview = width;
  gCalMaxMinHPreview = height;
}

void fill_min_slot(int slot, uint8_t* src, uint8_t* min_map, int width, int height) {
  gCalMCSrcPreview[slot] = src;
  gCalMCDstPreview[slot] = min_map;
  gCalMCWPreview = width;
  gCalMCHPreview = height;
}

// All three functions on one image.
void compare(Random& random, Mood mood, int width, int height, int slot, size_t skew = 0) {
  const std::vector<uint8_t> content = make_image(random, mood, 3 * width, height);
  const Maps want = reference_maps(content, width, height);
  GuardedBuffer<uint8_t> src(content, skew);
  const auto expect = [&](const GuardedBuffer<uint8_t>& map, const std::vector<uint8_t>& wanted,
                          const char* what) {
    EXPECT_TRUE(bytes_match(map, wanted,
                            {{"width", width}, {"height", height}, {"slot", slot}, {"row", width}}))
        << what;
  };
  const size_t bytes = area(width, height);
  {
    GuardedBuffer<uint8_t> min_map(bytes, 1, skew);
    GuardedBuffer<uint8_t> max_map(bytes, 1, skew);
    CalculateMaxMinChannel(src.data(), min_map.data(), max_map.data(), width, height);
    expect(min_map, want.min, "minimum, one thread");
    expect(max_map, want.max, "maximum, one thread");
  }
  {
    GuardedBuffer<uint8_t> min_map(bytes, 2, skew);
    GuardedBuffer<uint8_t> max_map(bytes, 2, skew);
    EXPECT_EQ(CalculateMaxMinChannelPreview(src.data(), min_map.data(), max_map.data(), width,
                                            height, slot),
              0);
    expect(min_map, want.min, "minimum, eight threads");
    expect(max_map, want.max, "maximum, eight threads");
  }
  GuardedBuffer<uint8_t> min_map(bytes, 3, skew);
  EXPECT_EQ(CalculateMinChannelPreview(src.data(), min_map.data(), width, height, slot), 0);
  expect(min_map, want.min, "minimum, four threads");
  EXPECT_TRUE(bytes_match(src, content));
}

// All 2^24 pixels; the first byte by call.
TEST(ChannelMaps, EveryPixel) {
  std::vector<uint8_t> src(3 * area(256, 256));
  std::vector<uint8_t> min_map(area(256, 256));
  std::vector<uint8_t> max_map(min_map.size());
  std::vector<uint8_t> want_min(min_map.size());
  std::vector<uint8_t> want_max(min_map.size());
  for (size_t i = 0; i < min_map.size(); ++i) {
    src[3 * i + 1] = static_cast<uint8_t>(i / 256);
    src[3 * i + 2] = static_cast<uint8_t>(i % 256);
  }
  for (int first = 0; first < 256; ++first) {
    for (size_t i = 0; i < min_map.size(); ++i) {
      src[3 * i] = static_cast<uint8_t>(first);
      want_min[i] = reference::min_of_pixel(&src[3 * i]);
      want_max[i] = reference::max_of_pixel(&src[3 * i]);
      min_map[i] = static_cast<uint8_t>(~want_min[i]);
      max_map[i] = static_cast<uint8_t>(~want_max[i]);
    }
    CalculateMaxMinChannel(src.data(), min_map.data(), max_map.data(), 256, 256);
    ASSERT_TRUE(bytes_match(min_map, want_min, {{"minimum, first byte", first}, {"row", 256}}));
    ASSERT_TRUE(bytes_match(max_map, want_max, {{"maximum, first byte", first}, {"row", 256}}));
  }
}

TEST(ChannelMaps, OrderOfChannelsDoesNotMatter) {
  const uint8_t orders[][3] = {{10, 200, 30}, {10, 30, 200}, {200, 10, 30},
                               {200, 30, 10}, {30, 10, 200}, {30, 200, 10}};
  std::vector<uint8_t> src;
  for (const auto& pixel : orders) src.insert(src.end(), pixel, pixel + 3);
  std::vector<uint8_t> min_map(6);
  std::vector<uint8_t> max_map(6);
  CalculateMaxMinChannel(src.data(), min_map.data(), max_map.data(), 6, 1);
  EXPECT_TRUE(all_bytes_are(min_map, 10));
  EXPECT_TRUE(all_bytes_are(max_map, 200));
  min_map.assign(6, 0);
  max_map.assign(6, 0);
  EXPECT_EQ(CalculateMaxMinChannelPreview(src.data(), min_map.data(), max_map.data(), 6, 1, 5), 0);
  EXPECT_TRUE(all_bytes_are(min_map, 10));
  EXPECT_TRUE(all_bytes_are(max_map, 200));
  min_map.assign(6, 0);
  EXPECT_EQ(CalculateMinChannelPreview(src.data(), min_map.data(), 6, 1, 5), 0);
  EXPECT_TRUE(all_bytes_are(min_map, 10));
}

TEST(ChannelMaps, WidthsUpTo40) {
  Random random(test_seed());
  for (int width = 1; width <= 40; ++width)
    compare(random, random.one_of(kMoods), width, random.between(1, 12), width % 8);
}

TEST(ChannelMaps, HeightsUpTo40) {
  Random random(test_seed());
  for (int height = 1; height <= 40; ++height)
    compare(random, random.one_of(kMoods), random.between(1, 40), height, 7 - height % 8);
}

TEST(ChannelMaps, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew)
    compare(random, Mood::kNoise, random.between(1, 60), 3, 0, skew);
}

TEST(ChannelMaps, FrameSizes) {
  Random random(test_seed());
  compare(random, Mood::kNoise, 640, 360, 1);
  compare(random, Mood::kBlocks, 1280, 720, 6);
  compare(random, Mood::kSparks, 321, 243, 3);
}

TEST(ChannelMaps, TouchNothingPastTheEnd) {
  Random random(test_seed());
  for (int width = 1; width <= 140; ++width) {
    PageEndBuffer<uint8_t> src(make_image(random, Mood::kNoise, 3 * width, 2));
    const Maps want =
        reference_maps(std::vector<uint8_t>(src.data(), src.data() + src.size()), width, 2);
    PageEndBuffer<uint8_t> min_map(want.min.size());
    PageEndBuffer<uint8_t> max_map(want.max.size());
    CalculateMaxMinChannel(src.data(), min_map.data(), max_map.data(), width, 2);
    EXPECT_TRUE(bytes_match(min_map, want.min, {{"width", width}}));
    EXPECT_TRUE(bytes_match(max_map, want.max, {{"width", width}}));
    PageEndBuffer<uint8_t> again(want.min.size());
    fill_min_slot(0, src.data(), again.data(), width, 2);
    run_worker(CalMCThreadPreview, kMinStripes - 1);
    EXPECT_TRUE(bytes_match(again, want.min, {{"width", width}}));
  }
}

TEST(ChannelMaps, EmptySizesWriteNothing) {
  std::vector<uint8_t> src(3072, 70);
  const int sizes[][2] = {{0, 0},    {0, 16},   {16, 0},    {-1, 16},      {16, -1},
                          {16, -8},  {16, -20}, {-16, -8},  {-16, -20},    {INT_MIN, 16},
                          {-4, -64}, {-1, -1},  {-16, -16}, {16, INT_MIN}, {-8, 1}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> maps(2048, kUnwritten);
    uint8_t* const middle = src.data() + 1536;
    uint8_t* const min_map = maps.data() + 512;
    uint8_t* const max_map = maps.data() + 1536;
    CalculateMaxMinChannel(middle, min_map, max_map, size[0], size[1]);
    EXPECT_EQ(CalculateMaxMinChannelPreview(middle, min_map, max_map, size[0], size[1], 1), 0);
    EXPECT_EQ(CalculateMinChannelPreview(middle, min_map, size[0], size[1], 2), 0);
    fill_max_min_slot(3, middle, min_map, max_map, size[0], size[1]);
    fill_min_slot(3, middle, min_map, size[0], size[1]);
    for (int stripe = 0; stripe < kMaxMinStripes; ++stripe)
      run_worker(CalMaxMinThreadPreview, 30 + stripe);
    for (int stripe = 0; stripe < kMinStripes; ++stripe)
      run_worker(CalMCThreadPreview, 30 + stripe);
    EXPECT_TRUE(all_bytes_are(maps, kUnwritten, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(ThreadedChannelMaps, KeepTheirArgumentsInTheSlot) {
  std::vector<uint8_t> src(3 * area(6, 20), 10);
  std::vector<uint8_t> min_map(area(6, 20));
  std::vector<uint8_t> max_map(area(6, 20));
  for (const int slot : {4, 0, 7, 2, 5, 1, 6, 3}) {
    Globals want = Globals::now();
    const size_t at = static_cast<size_t>(slot);
    CalculateMaxMinChannelPreview(src.data(), min_map.data(), max_map.data(), 6, 10 + slot, slot);
    want.pointers[2][at] = src.data();
    want.pointers[3][at] = min_map.data();
    want.pointers[4][at] = max_map.data();
    want.sizes[2] = 6;
    want.sizes[3] = 10 + slot;
    EXPECT_TRUE(Globals::now() == want) << "slot " << slot;
    CalculateMinChannelPreview(src.data(), max_map.data(), 5, 11 + slot, slot);
    want.pointers[0][at] = src.data();
    want.pointers[1][at] = max_map.data();
    want.sizes[0] = 5;
    want.sizes[1] = 11 + slot;
    EXPECT_TRUE(Globals::now() == want) << "slot " << slot;
  }
}

TEST(ThreadedChannelMaps, OtherSlotsTouchNothing) {
  std::vector<uint8_t> src(3 * area(16, 16), 70);
  for (const int slot : kSlotsOutOfRange) {
    GuardedBuffer<uint8_t> min_map(area(16, 16), kUnwritten);
    GuardedBuffer<uint8_t> max_map(area(16, 16), kUnwritten);
    const Globals before = Globals::now();
    EXPECT_EQ(
        CalculateMaxMinChannelPreview(src.data(), min_map.data(), max_map.data(), 16, 16, slot), 0);
    EXPECT_EQ(CalculateMinChannelPreview(src.data(), min_map.data(), 17, 15, slot), 0);
    EXPECT_TRUE(Globals::now() == before) << "slot " << slot;
    EXPECT_TRUE(all_bytes_are(min_map, kUnwritten, {{"slot", slot}}));
    EXPECT_TRUE(all_bytes_are(max_map, kUnwritten, {{"slot", slot}}));
  }
}

TEST(ThreadedChannelMaps, AllSlotsAtOnce) {
  constexpr int kWidth = 61;
  constexpr int kHeight = 53;
  Random random(test_seed());
  std::vector<std::vector<uint8_t>> sources;
  std::vector<Maps> actual;
  std::vector<std::vector<uint8_t>> four_threads;
  for (int slot = 0; slot < kSlotCount; ++slot) {
    sources.push_back(make_image(random, Mood::kNoise, 3 * kWidth, kHeight));
    const std::vector<uint8_t> unwritten(area(kWidth, kHeight), kUnwritten);
    actual.push_back({unwritten, unwritten});
    four_threads.push_back(unwritten);
  }
  in_all_slots_at_once([&](int slot) {
    const size_t at = static_cast<size_t>(slot);
    CalculateMaxMinChannelPreview(sources[at].data(), actual[at].min.data(), actual[at].max.data(),
                                  kWidth, kHeight, slot);
    CalculateMinChannelPreview(sources[at].data(), four_threads[at].data(), kWidth, kHeight, slot);
  });
  for (size_t at = 0; at < kSlotCount; ++at) {
    const Maps want = reference_maps(sources[at], kWidth, kHeight);
    EXPECT_TRUE(bytes_match(actual[at].min, want.min, {{"slot", at}}));
    EXPECT_TRUE(bytes_match(actual[at].max, want.max, {{"slot", at}}));
    EXPECT_TRUE(bytes_match(four_threads[at], want.min, {{"slot", at}}));
  }
}

// Runs one stripe of each family by hand-filled globals and compares whole maps, so that rows of
// other stripes show.
void expect_max_min_stripe(Random& random, int width, int height, int slot, int stripe) {
  std::vector<uint8_t> src = make_image(random, Mood::kNoise, 3 * width, height);
  GuardedBuffer<uint8_t> min_map(area(width, height), kUnwritten);
  GuardedBuffer<uint8_t> max_map(area(width, height), kUnwritten);
  std::vector<uint8_t> want_min(min_map.size(), kUnwritten);
  std::vector<uint8_t> want_max(min_map.size(), kUnwritten);
  fill_max_min_slot(slot, src.data(), min_map.data(), max_map.data(), width, height);
  const Globals before = Globals::now();
  run_worker(CalMaxMinThreadPreview, slot * 10 + stripe);
  EXPECT_TRUE(Globals::now() == before);
  reference::channel_maps(src.data(), want_min.data(), want_max.data(), width,
                          reference::even_stripe_rows(height, kMaxMinStripes, stripe));
  EXPECT_TRUE(
      bytes_match(min_map, want_min, {{"height", height}, {"stripe", stripe}, {"row", width}}));
  EXPECT_TRUE(
      bytes_match(max_map, want_max, {{"height", height}, {"stripe", stripe}, {"row", width}}));
}

void expect_min_stripe(Random& random, int width, int height, int slot, int stripe) {
  std::vector<uint8_t> src = make_image(random, Mood::kNoise, 3 * width, height);
  GuardedBuffer<uint8_t> min_map(area(width, height), kUnwritten);
  std::vector<uint8_t> want(min_map.size(), kUnwritten);
  fill_min_slot(slot, src.data(), min_map.data(), width, height);
  const Globals before = Globals::now();
  run_worker(CalMCThreadPreview, slot * 10 + stripe);
  EXPECT_TRUE(Globals::now() == before);
  reference::channel_maps(src.data(), want.data(), nullptr, width,
                          reference::even_stripe_rows(height, kMinStripes, stripe));
  EXPECT_TRUE(bytes_match(min_map, want, {{"height", height}, {"stripe", stripe}, {"row", width}}));
}

TEST(ChannelMapWorkers, StripesOfHeight20OnEightThreads) {
  Random random(test_seed());
  for (int stripe = 0; stripe < 8; ++stripe) {
    const reference::ImageRows rows = reference::even_stripe_rows(20, 8, stripe);
    EXPECT_EQ(rows.first, 2 * stripe);
    EXPECT_EQ(rows.count, stripe < 7 ? 2 : 6);
    expect_max_min_stripe(random, 5, 20, stripe, stripe);
  }
}

TEST(ChannelMapWorkers, StripesOfHeight30OnFourThreads) {
  Random random(test_seed());
  for (int stripe = 0; stripe < 4; ++stripe) {
    const reference::ImageRows rows = reference::even_stripe_rows(30, 4, stripe);
    EXPECT_EQ(rows.first, 6 * stripe);
    EXPECT_EQ(rows.count, stripe < 3 ? 6 : 12);
    expect_min_stripe(random, 5, 30, stripe, stripe);
  }
}

// Below 8 and 4 rows the last stripe is the whole image; from 16 and 8 rows on all have some.
TEST(ChannelMapWorkers, EveryStripeOfHeightsUpTo40) {
  Random random(test_seed());
  for (int height = 1; height <= 40; ++height) {
    const int width = random.between(1, 11);
    for (int stripe = 0; stripe < kMaxMinStripes; ++stripe)
      expect_max_min_stripe(random, width, height, height % 8, stripe);
    for (int stripe = 0; stripe < kMinStripes; ++stripe)
      expect_min_stripe(random, width, height, height % 8, stripe);
  }
}

TEST(ChannelMapWorkers, OtherCodesWriteNothing) {
  std::vector<uint8_t> src(3 * area(8, 40), 70);
  GuardedBuffer<uint8_t> maps(2 * area(8, 40), kUnwritten);
  for (int slot = 0; slot < kSlotCount; ++slot) {
    fill_max_min_slot(slot, src.data(), maps.data(), maps.data() + 320, 8, 40);
    fill_min_slot(slot, src.data(), maps.data(), 8, 40);
  }
  for (const int code : codes_out_of_range(kMaxMinStripes))
    run_worker(CalMaxMinThreadPreview, code);
  for (const int code : codes_out_of_range(kMinStripes)) run_worker(CalMCThreadPreview, code);
  EXPECT_TRUE(all_bytes_are(maps, kUnwritten));
}

}  // namespace
}  // namespace haze::test
