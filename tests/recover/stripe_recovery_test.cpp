#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"
#include "tests/support/recovery_sweeps.h"

namespace haze::test {
namespace {

using Frame = std::vector<uint8_t>;
using Map = std::vector<float>;
using reference::LightYuv;

LightYuv random_yuv(Random& random) { return {random.byte(), random.byte(), random.byte()}; }

void recover_stripe(uint8_t* luma, uint8_t* chroma, float* t, const LightYuv& light, int width,
                    int height) {
  HazeRemovingThreadPreview(luma, chroma, t, static_cast<uint8_t>(light.y),
                            static_cast<uint8_t>(light.u), static_cast<uint8_t>(light.v), width,
                            height);
}

// Luma and chroma in buffers of their own.
void compare(const Frame& frame, const Map& map, const LightYuv& light, int width, int height) {
  const size_t luma_bytes = static_cast<size_t>(width * height);
  Frame want = frame;
  reference::recover_anchors(want.data(), want.data() + luma_bytes, map.data(), light, width,
                             height);
  GuardedBuffer<uint8_t> luma(Frame(frame.data(), frame.data() + luma_bytes));
  GuardedBuffer<uint8_t> chroma(Frame(frame.data() + luma_bytes, frame.data() + frame.size()));
  GuardedBuffer<float> transmission(map);
  recover_stripe(luma.data(), chroma.data(), transmission.data(), light, width, height);
  const std::initializer_list<Argument> arguments = {
      {"width", width}, {"height", height}, {"first t", map[0]}, {"AY", light.y},
      {"ACb", light.u}, {"ACr", light.v},   {"row", width}};
  ASSERT_TRUE(bytes_match(luma, {want.data(), luma_bytes}, arguments)) << "luma";
  ASSERT_TRUE(bytes_match(chroma, {want.data() + luma_bytes, luma_bytes / 2}, arguments))
      << "chroma";
  ASSERT_TRUE(planes_match(transmission, map));
}

void fill_slot(int slot, uint8_t* frame, float* map, const LightYuv& light, int width, int height) {
  gHRSrcPreview[slot] = frame;
  gHRScalePreview[slot] = map;
  gAYPreview[slot] = static_cast<uint8_t>(light.y);
  gACbPreview[slot] = static_cast<uint8_t>(light.u);
  gACrPreview[slot] = static_cast<uint8_t>(light.v);
  gHRWPreview = width;
  gHRHWPreview = height;
}

void run_job(int job) {
  int number = job;
  EXPECT_EQ(HRThreadPreview(&number), nullptr);
  EXPECT_EQ(number, job);
}

TEST(StripeRecovery, IsTheAnchorRecoveryOfAFrame) {
  Random random(test_seed());
  for (int i = 0; i < 20; ++i) {
    const int width = 2 * random.between(1, 20);
    const int height = 2 * random.between(1, 20);
    Light light = random_light(random);
    Frame as_stripe = make_frame(random, Mood::kNoise, Colours::kWild, width, height);
    Frame as_frame = as_stripe;
    Map map = make_transmissions(random, TransmissionMood::kUsual, width, height);
    recover_stripe(as_stripe.data(), as_stripe.data() + width * height, map.data(),
                   reference::light_to_yuv(light.data()), width, height);
    HazeRemovingPreview(as_frame.data(), map.data(), light.data(), width, height, 0);
    EXPECT_TRUE(bytes_match(as_stripe, as_frame, {{"width", width}, {"height", height}}));
  }
}

TEST(StripeRecovery, SizesUpTo40InEveryMood) {
  Random random(test_seed());
  for_sizes_up_to_40(random, [&](const Map& map, int width, int height) {
    compare(make_frame(random, random.one_of(kMoods), Colours::kWild, width, height), map,
            random_yuv(random), width, height);
  });
}

TEST(StripeRecovery, WidthsUpTo200) {
  Random random(test_seed());
  for_widths_up_to_200(random, [&](const Map& map, int width, int height) {
    compare(make_frame(random, random.one_of(kMoods), Colours::kWild, width, height), map,
            random_yuv(random), width, height);
  });
}

TEST(StripeRecovery, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 90}, {1280, 180}, {2, 180}, {1280, 2}};
  for (const auto& size : sizes)
    compare(make_hazy_frame(random, size[0], size[1]),
            make_transmissions(random, TransmissionMood::kUsual, size[0], size[1]),
            random_yuv(random), size[0], size[1]);
}

// The map's next row is another stripe's: it neither counts nor is read.
TEST(StripeRecovery, LastBlockRowUsesItsOwnTransmissions) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 70; ++half_width) {
    const int width = 2 * half_width;
    const Frame content = make_frame(random, Mood::kNoise, Colours::kWild, width, 6);
    const Map map = make_transmissions(random, TransmissionMood::kUsual, width, 6);
    const LightYuv light = random_yuv(random);
    const size_t luma_bytes = static_cast<size_t>(width * 6);
    PageEndBuffer<uint8_t> luma(Frame(content.data(), content.data() + luma_bytes));
    PageEndBuffer<uint8_t> chroma(
        Frame(content.data() + luma_bytes, content.data() + content.size()));
    PageEndBuffer<float> transmission(map);
    recover_stripe(luma.data(), chroma.data(), transmission.data(), light, width, 6);
    Frame want = content;
    reference::recover_anchors(want.data(), want.data() + luma_bytes, map.data(), light, width, 6);
    EXPECT_TRUE(bytes_match(luma, {want.data(), luma_bytes}, {{"width", width}}));
    EXPECT_TRUE(bytes_match(chroma, {want.data() + luma_bytes, luma_bytes / 2}));
  }
}

// Chroma has no tone curve, so here every result of the integer formula is seen: rows of blocks by
// index, columns by byte, then some columns and a row more, so that all meet in steps of any vector
// path. U sees the lights below 128, V those from 128 on. In four parts, so that they may run side
// by side.
class EveryIndexLightAndChroma : public ::testing::TestWithParam<int> {};

INSTANTIATE_TEST_SUITE_P(Quarters, EveryIndexLightAndChroma, ::testing::Values(0, 1, 2, 3));

TEST_P(EveryIndexLightAndChroma, InBothPlanes) {
  constexpr int kColumns = 256 + 32;
  constexpr int kRows = 256 + 1;
  constexpr size_t kPlane = kColumns * kRows;
  Map map;
  std::vector<int> indices;
  for (int y = 0; y < kRows; ++y) {
    const int index = std::min(y, 255);
    indices.insert(indices.end(), kColumns, index);
    const float t = (static_cast<float>(index) + 0.5f) / 255.0f;
    map.insert(map.end(), kColumns, index == 255 ? 1.0f : t);
  }
  Frame luma(4 * kPlane, 100);
  Frame chroma(2 * kPlane);
  Frame want(2 * kPlane);
  for (int light = GetParam(); light < 128; light += 4) {
    for (size_t i = 0; i < kPlane; ++i) {
      const int value = static_cast<int>(i % kColumns % 256);
      chroma[i] = static_cast<uint8_t>(value);
      chroma[kPlane + i] = static_cast<uint8_t>(255 - value);
      want[i] = reference::recover_integer(value, light, indices[i]);
      want[kPlane + i] = reference::recover_integer(255 - value, 128 + light, indices[i]);
    }
    recover_stripe(luma.data(), chroma.data(), map.data(), {light, light, 128 + light},
                   2 * kColumns, 2 * kRows);
    ASSERT_TRUE(bytes_match(chroma, want, {{"light", light}, {"row", kColumns}}));
  }
}

TEST(StripeRecovery, EmptySizesWriteNothing) {
  Map map(256, 0.5f);
  const int sizes[][2] = {{0, 0},   {0, 2},       {2, 0},       {-2, 2},  {2, -2}, {-2, -2},
                          {-8, -8}, {INT_MIN, 2}, {2, INT_MIN}, {-16, 4}, {4, -16}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> luma(600, 60);
    GuardedBuffer<uint8_t> chroma(600, 60);
    recover_stripe(luma.data() + 300, chroma.data() + 300, map.data() + 128, {1, 2, 3}, size[0],
                   size[1]);
    EXPECT_TRUE(all_bytes_are(luma, 60, {{"width", size[0]}, {"height", size[1]}}));
    EXPECT_TRUE(all_bytes_are(chroma, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

void expect_rows(int height, int stripe, int first, int count) {
  EXPECT_EQ(reference::quarter_stripe(height, stripe).first, first);
  EXPECT_EQ(reference::quarter_stripe(height, stripe).count, count);
}

// One stripe of a frame, the whole frame compared: a stripe's V plane begins right after its own U
// rows.
void compare_stripe(Random& random, int width, int height, int slot, int stripe) {
  Frame frame = make_frame(random, Mood::kNoise, Colours::kWild, width, height);
  const Map map = make_transmissions(random, TransmissionMood::kUsual, width, height);
  const LightYuv light = random_yuv(random);
  GuardedBuffer<uint8_t> actual(frame);
  GuardedBuffer<float> transmission(map);
  fill_slot(slot, actual.data(), transmission.data(), light, width, height);
  run_job(10 * slot + stripe);
  reference::recover_stripe(frame.data(), map.data(), light, width, height, stripe);
  EXPECT_TRUE(bytes_match(
      actual, frame,
      {{"width", width}, {"height", height}, {"slot", slot}, {"stripe", stripe}, {"row", width}}));
  EXPECT_TRUE(planes_match(transmission, map));
}

TEST(StripeWorker, StripesOfHeight720) {
  Random random(test_seed());
  for (int stripe = 0; stripe < 4; ++stripe) {
    expect_rows(720, stripe, 180 * stripe, 180);
    compare_stripe(random, 20, 720, 0, stripe);
  }
}

TEST(StripeWorker, StripesOfHeight730) {
  Random random(test_seed());
  for (int stripe = 0; stripe < 3; ++stripe) expect_rows(730, stripe, 182 * stripe, 182);
  expect_rows(730, 3, 546, 184);
  for (int stripe = 0; stripe < 4; ++stripe) compare_stripe(random, 20, 730, 2, stripe);
}

TEST(StripeWorker, Job13IsSlot1Stripe3) {
  Random random(test_seed());
  for (int slot = 0; slot < 8; ++slot) fill_slot(slot, nullptr, nullptr, {0, 0, 0}, 8, 40);
  compare_stripe(random, 8, 40, 1, 3);
}

TEST(StripeWorker, EveryStripeOfHeightsUpTo60) {
  Random random(test_seed());
  for (int height = 2; height <= 60; height += 2)
    for (int stripe = 0; stripe < 4; ++stripe)
      compare_stripe(random, 2 * random.between(1, 40), height, (height / 2 + stripe) % 8, stripe);
}

TEST(StripeWorker, LeavesItsGlobals) {
  Random random(test_seed());
  Frame frames[8];
  Map maps[8];
  for (int slot = 0; slot < 8; ++slot) {
    frames[slot] = make_frame(random, Mood::kNoise, Colours::kWild, 12, 24);
    maps[slot] = make_transmissions(random, TransmissionMood::kUsual, 12, 24);
    fill_slot(slot, frames[slot].data(), maps[slot].data(), {slot, 10 + slot, 20 + slot}, 12, 24);
  }
  for (const int job : {33, 0, 71, 52, 13}) run_job(job);
  EXPECT_EQ(gHRWPreview, 12);
  EXPECT_EQ(gHRHWPreview, 24);
  for (int slot = 0; slot < 8; ++slot) {
    EXPECT_EQ(gHRSrcPreview[slot], frames[slot].data());
    EXPECT_EQ(gHRScalePreview[slot], maps[slot].data());
    EXPECT_EQ(gAYPreview[slot], slot);
    EXPECT_EQ(gACbPreview[slot], 10 + slot);
    EXPECT_EQ(gACrPreview[slot], 20 + slot);
  }
}

// Stripes write chroma rows of others, so their order shows in the result.
TEST(StripeWorker, AllStripesInAnyOrder) {
  Random random(test_seed());
  const int orders[][4] = {{0, 1, 2, 3}, {3, 2, 1, 0}, {2, 0, 3, 1}};
  for (const auto& order : orders)
    for (int i = 0; i < 6; ++i) {
      const int width = 2 * random.between(1, 20);
      const int height = 2 * random.between(4, 40);
      const Frame content = make_frame(random, Mood::kNoise, Colours::kWild, width, height);
      Map map = make_transmissions(random, TransmissionMood::kUsual, width, height);
      const LightYuv light = random_yuv(random);
      GuardedBuffer<uint8_t> frame(content);
      Frame want = content;
      fill_slot(i, frame.data(), map.data(), light, width, height);
      for (const int stripe : order) {
        run_job(10 * i + stripe);
        reference::recover_stripe(want.data(), map.data(), light, width, height, stripe);
      }
      EXPECT_TRUE(bytes_match(frame, want, {{"width", width}, {"height", height}, {"row", width}}));
    }
}

// One thread per slot, with a frame, a map and a light of its own; they share width and height.
TEST(StripeWorkerThreads, EverySlotOnAThread) {
  constexpr int kWidth = 48;
  constexpr int kHeight = 44;
  Random random(test_seed());
  std::vector<Frame> frames;
  std::vector<Frame> wanted;
  std::vector<Map> maps;
  for (int slot = 0; slot < 8; ++slot) {
    frames.push_back(make_frame(random, Mood::kNoise, Colours::kWild, kWidth, kHeight));
    maps.push_back(make_transmissions(random, TransmissionMood::kUsual, kWidth, kHeight));
    wanted.push_back(frames.back());
    const LightYuv light = random_yuv(random);
    fill_slot(slot, frames.back().data(), maps.back().data(), light, kWidth, kHeight);
    for (int stripe = 0; stripe < 4; ++stripe)
      reference::recover_stripe(wanted.back().data(), maps.back().data(), light, kWidth, kHeight,
                                stripe);
  }
  std::vector<std::thread> threads;
  for (int slot = 0; slot < 8; ++slot)
    threads.emplace_back([slot] {
      for (int stripe = 0; stripe < 4; ++stripe) run_job(10 * slot + stripe);
    });
  for (std::thread& thread : threads) thread.join();
  for (size_t slot = 0; slot < 8; ++slot)
    EXPECT_TRUE(bytes_match(frames[slot], wanted[slot], {{"slot", slot}, {"row", kWidth}}));
}

TEST(StripeWorker, OtherJobsTouchNothing) {
  GuardedBuffer<uint8_t> frame(600, 60);
  Map map(300, 0.5f);
  for (int slot = 0; slot < 8; ++slot)
    fill_slot(slot, frame.data() + 200, map.data() + 100, {1, 2, 3}, 8, 16);
  for (const int job : {-1, -3, -10, -13, 4, 5, 9, 14, 79, 80, 83, 100, INT_MAX, INT_MIN}) {
    run_job(job);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"job", job}}));
  }
  EXPECT_EQ(gHRWPreview, 8);
  EXPECT_EQ(gHRHWPreview, 16);
}

TEST(StripeWorker, EmptyAndOddSizesWriteNothing) {
  Map map(256, 0.5f);
  const int sizes[][2] = {{0, 0},        {0, 16},       {16, 0},   {-2, 16}, {16, -2},
                          {-2, -2},      {-8, -8},      {16, 13},  {15, 16}, {16, 1},
                          {INT_MIN, 16}, {16, INT_MIN}, {-16, 16}, {4, -16}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> frame(1200, 60);
    fill_slot(3, frame.data() + 600, map.data() + 128, {1, 2, 3}, size[0], size[1]);
    for (int stripe = 0; stripe < 4; ++stripe) run_job(30 + stripe);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

}  // namespace
}  // namespace haze::test
