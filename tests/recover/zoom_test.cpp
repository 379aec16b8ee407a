// Frames to half-resolution BGR by eight threads.
#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/zoom.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/stripe_workers.h"

namespace haze::test {
namespace {

constexpr uint8_t kUnwritten = 0xA5;
constexpr int kStripes = 8;
constexpr int kNv21 = 0;
constexpr int kPlanar = 3;
constexpr int kFormats[] = {kNv21, kPlanar};

size_t area(int width, int height) { return static_cast<size_t>(width * height); }
size_t bgr_bytes(int width, int height) { return 3 * area(width / 2, height / 2); }

// Puts a format into force until the end of the test.
class FormatInForce {
 public:
  explicit FormatInForce(int format) : before_(gPerviewFormat) {
    gPerviewFormat = static_cast<INPUT_FORMAT>(format);
  }
  FormatInForce(const FormatInForce&) = delete;
  FormatInForce& operator=(const FormatInForce&) = delete;
  ~FormatInForce() { gPerviewFormat = before_; }

 private:
  INPUT_FORMAT before_;
};

struct Globals {
  std::array<uint8_t*, kSlotCount> src;
  std::array<uint8_t*, kSlotCount> dst;
  std::array<int, 2> sizes;

  static Globals now() {
    Globals globals = {};
    for (size_t slot = 0; slot < kSlotCount; ++slot) {
      globals.src[slot] = gZoomOutSrcPreview[slot];
      globals.dst[slot] = gZoomOutDstPreview[slot];
    }
    globals.sizes = {gZoomOutWPreview, gZoomOutHPreview};
    return globals;
  }
  bool operator==(const Globals& other) const {
    return src == other.src && dst == other.dst && sizes == other.sizes;
  }
};

void fill_slot(int slot, uint8_t* src, uint8_t* dst, int width, int height) {
  gZoomOutSrcPreview[slot] = src;
  gZoomOutDstPreview[slot] = dst;
  gZoomOutWPreview = width;
  gZoomOutHPreview = height;
}

void compare_zoom_out(Random& random, Mood mood, int format, int width, int height, int slot,
                      size_t skew = 0) {
  const std::vector<uint8_t> content = make_frame(random, mood, Colours::kWild, width, height);
  GuardedBuffer<uint8_t> frame(content, skew);
  GuardedBuffer<uint8_t> bgr(bgr_bytes(width, height), kUnwritten, skew);
  // Rows that no stripe covers keep their bytes.
  std::vector<uint8_t> want(bgr.size(), kUnwritten);
  const FormatInForce in_force(format);
  ZoomOutImgPreview(frame.data(), bgr.data(), width, height, slot);
  reference::zoom_out(content.data(), want.data(), width, height, format == kPlanar);
  ASSERT_TRUE(bytes_match(bgr, want,
                          {{"format", format},
                           {"width", width},
                           {"height", height},
                           {"slot", slot},
                           {"row", 3 * (width / 2)}}));
  ASSERT_TRUE(bytes_match(frame, content));
}

TEST(ZoomOut, EveryEvenHeightUpTo100) {
  Random random(test_seed());
  for (int height = 2; height <= 100; height += 2)
    compare_zoom_out(random, random.one_of(kMoods), random.one_of(kFormats),
                     2 * random.between(1, 20), height, height / 2 % 8);
}

TEST(ZoomOut, EveryEvenWidthUpTo80) {
  Random random(test_seed());
  for (int width = 2; width <= 80; width += 2)
    compare_zoom_out(random, random.one_of(kMoods), random.one_of(kFormats), width,
                     2 * random.between(1, 30), 7 - width / 2 % 8);
}

TEST(ZoomOut, FrameSizes) {
  Random random(test_seed());
  for (const int format : kFormats) {
    compare_zoom_out(random, Mood::kNoise, format, 640, 360, 2);
    compare_zoom_out(random, Mood::kGradient, format, 1280, 720, 5);
    compare_zoom_out(random, Mood::kBlocks, format, 130, 142, 0);
  }
}

TEST(ZoomOut, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew)
    compare_zoom_out(random, Mood::kNoise, skew % 2 == 0 ? kNv21 : kPlanar, 46, 34, 1, skew);
}

TEST(ZoomOut, EveryFormatBut3IsNv21) {
  Random random(test_seed());
  for (const int format : {0, 1, 2, 4, 5, 17, -1, -3, 259, INT_MAX, INT_MIN})
    compare_zoom_out(random, Mood::kNoise, format, 22, 18, 3);
}

TEST(ZoomOut, KeepsItsArgumentsInTheSlot) {
  std::vector<uint8_t> frame(600, 128);
  std::vector<uint8_t> bgr(300);
  const FormatInForce in_force(kNv21);
  for (const int slot : {2, 7, 0, 5, 1, 4, 6, 3}) {
    Globals want = Globals::now();
    ZoomOutImgPreview(frame.data(), bgr.data(), 20, 4 + 2 * slot, slot);
    want.src[static_cast<size_t>(slot)] = frame.data();
    want.dst[static_cast<size_t>(slot)] = bgr.data();
    want.sizes = {20, 4 + 2 * slot};
    EXPECT_TRUE(Globals::now() == want) << "slot " << slot;
  }
}

TEST(ZoomOut, OtherSlotsTouchNothing) {
  std::vector<uint8_t> frame(384, 70);
  for (const int slot : kSlotsOutOfRange) {
    GuardedBuffer<uint8_t> bgr(bgr_bytes(16, 16), kUnwritten);
    const Globals before = Globals::now();
    ZoomOutImgPreview(frame.data(), bgr.data(), 16, 16, slot);
    EXPECT_TRUE(Globals::now() == before) << "slot " << slot;
    EXPECT_TRUE(all_bytes_are(bgr, kUnwritten, {{"slot", slot}}));
  }
}

TEST(ZoomOut, EmptySizesWriteNothing) {
  std::vector<uint8_t> frame(4096, 70);
  const int sizes[][2] = {{0, 0},   {0, 16},      {16, 0},      {-2, 16},   {16, -2},  {16, -16},
                          {-8, -8}, {INT_MIN, 8}, {8, INT_MIN}, {-16, -64}, {-64, 16}, {16, -32}};
  for (const int format : kFormats)
    for (const auto& size : sizes) {
      GuardedBuffer<uint8_t> bgr(4096, kUnwritten);
      const FormatInForce in_force(format);
      ZoomOutImgPreview(frame.data() + 2048, bgr.data() + 2048, size[0], size[1], 2);
      fill_slot(6, frame.data() + 2048, bgr.data() + 2048, size[0], size[1]);
      for (int stripe = 0; stripe < kStripes; ++stripe)
        run_worker(ZoomOutThreadPreview, 60 + stripe);
      EXPECT_TRUE(all_bytes_are(bgr, kUnwritten,
                                {{"format", format}, {"width", size[0]}, {"height", size[1]}}));
    }
}

// Sides must be even.
TEST(ZoomOut, OddSizesWriteNothing) {
  std::vector<uint8_t> frame(4096, 70);
  const int sizes[][2] = {{1, 1}, {1, 2}, {2, 1}, {17, 16}, {16, 17}, {33, 31}, {15, 64}};
  for (const int format : kFormats)
    for (const auto& size : sizes) {
      GuardedBuffer<uint8_t> bgr(2048, kUnwritten);
      const FormatInForce in_force(format);
      ZoomOutImgPreview(frame.data(), bgr.data(), size[0], size[1], 2);
      EXPECT_TRUE(all_bytes_are(bgr, kUnwritten,
                                {{"format", format}, {"width", size[0]}, {"height", size[1]}}));
    }
}

// One stripe by hand-filled globals; the output of the others stays.
void expect_stripe(Random& random, int format, int width, int height, int slot, int stripe) {
  std::vector<uint8_t> frame = make_frame(random, Mood::kNoise, Colours::kWild, width, height);
  GuardedBuffer<uint8_t> bgr(bgr_bytes(width, height), kUnwritten);
  std::vector<uint8_t> want(bgr.size(), kUnwritten);
  const FormatInForce in_force(format);
  fill_slot(slot, frame.data(), bgr.data(), width, height);
  const Globals before = Globals::now();
  run_worker(ZoomOutThreadPreview, slot * 10 + stripe);
  EXPECT_TRUE(Globals::now() == before);
  reference::zoom_out_rows(frame.data(), want.data(), width, height, format == kPlanar,
                           reference::zoom_out_stripe(height, stripe));
  EXPECT_TRUE(bytes_match(bgr, want,
                          {{"format", format},
                           {"width", width},
                           {"height", height},
                           {"stripe", stripe},
                           {"row", 3 * (width / 2)}}));
}

void expect_stripes(const std::array<reference::ImageRows, kStripes>& stripes, int height) {
  Random random(test_seed());
  for (int stripe = 0; stripe < kStripes; ++stripe) {
    const reference::ImageRows rows = reference::zoom_out_stripe(height, stripe);
    EXPECT_EQ(rows.count, stripes[static_cast<size_t>(stripe)].count);
    if (rows.count != 0) {
      EXPECT_EQ(rows.first, stripes[static_cast<size_t>(stripe)].first);
    }
    for (const int format : kFormats) expect_stripe(random, format, 14, height, stripe, stripe);
  }
}

TEST(ZoomOutWorker, StripesOfHeight64) {
  expect_stripes({{{0, 8}, {8, 8}, {16, 8}, {24, 8}, {32, 8}, {40, 8}, {48, 8}, {56, 8}}}, 64);
}

// Stripe 3 converts rows 24 ... 39; nobody converts rows 64 ... 71.
TEST(ZoomOutWorker, StripesOfHeight72) {
  expect_stripes({{{0, 8}, {8, 8}, {16, 8}, {24, 16}, {32, 8}, {40, 8}, {48, 8}, {56, 8}}}, 72);
  std::vector<uint8_t> frame(area(16, 108), 128);
  std::vector<uint8_t> bgr(bgr_bytes(16, 72), kUnwritten);
  const FormatInForce in_force(kNv21);
  ZoomOutImgPreview(frame.data(), bgr.data(), 16, 72, 0);
  for (size_t i = 0; i < bgr.size(); ++i) EXPECT_EQ(bgr[i], i < 32 * 24 ? 128 : kUnwritten) << i;
}

// Below 16 rows stripe 3 is the whole frame.
TEST(ZoomOutWorker, StripesOfHeight10) {
  expect_stripes({{{0, 0}, {0, 0}, {0, 0}, {0, 10}, {0, 0}, {0, 0}, {0, 0}, {0, 0}}}, 10);
}

// Stripe 3 may end below stripe 7: here at row 22, with stripe 7 at row 16.
TEST(ZoomOutWorker, StripesOfHeight30) {
  expect_stripes({{{0, 2}, {2, 2}, {4, 2}, {6, 16}, {8, 2}, {10, 2}, {12, 2}, {14, 2}}}, 30);
}

TEST(ZoomOutWorker, EveryStripeOfHeightsUpTo80) {
  Random random(test_seed());
  for (int height = 2; height <= 80; height += 2)
    for (int stripe = 0; stripe < kStripes; ++stripe)
      expect_stripe(random, random.one_of(kFormats), 2 * random.between(1, 10), height,
                    height / 2 % 8, stripe);
}

TEST(ZoomOutWorker, OtherCodesWriteNothing) {
  std::vector<uint8_t> frame(384, 70);
  GuardedBuffer<uint8_t> bgr(bgr_bytes(16, 16), kUnwritten);
  const FormatInForce in_force(kNv21);
  for (int slot = 0; slot < kSlotCount; ++slot) fill_slot(slot, frame.data(), bgr.data(), 16, 16);
  for (const int code : codes_out_of_range(kStripes)) {
    run_worker(ZoomOutThreadPreview, code);
    EXPECT_TRUE(all_bytes_are(bgr, kUnwritten, {{"code", code}}));
  }
}

}  // namespace
}  // namespace haze::test
