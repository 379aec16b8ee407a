#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <thread>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/session.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

constexpr int kLevels[] = {-50, 0, 1, 40, 100, 117, 250};
constexpr int kFormats[] = {0, 3, 1, 2, 4, -1, 0x7fffffff, INT_MIN};

// The cached map as the packed codes of one frame size.
std::vector<uint8_t> cached_map(int width, int height) {
  std::vector<uint8_t> codes;
  for (int row = 0; row < height / 2; ++row)
    codes.insert(codes.end(), gPreT + row * 640, gPreT + row * 640 + width / 2);
  return codes;
}

// All black, NV21 neutral: every map is 0.
std::vector<uint8_t> black_frame(int width, int height) {
  std::vector<uint8_t> frame(static_cast<size_t>(width * height), 0);
  frame.insert(frame.end(), static_cast<size_t>(width * height / 2), 128);
  return frame;
}

void set_luma_of_block(std::vector<uint8_t>& frame, int width, int row, int column, uint8_t luma) {
  frame[static_cast<size_t>(2 * row * width + 2 * column)] = luma;
}

TEST(FrameDriver, AlternatesEstimateAndReuse) {
  SessionPair sessions;
  Random random(test_seed());
  sessions.init(0, 160, 128);
  std::vector<uint8_t> cache;
  for (int i = 0; i < 6; ++i) {
    const bool estimates = i % 2 == 0;
    EXPECT_EQ(gPreFrameNum, estimates ? 0 : 1);
    cache.assign(gPreT, gPreT + sizeof gPreT);
    sessions.remove_haze(make_hazy_frame(random, 160, 128), 160, 128, 60 + 20 * i);
    const std::vector<uint8_t> cache_after(gPreT, gPreT + sizeof gPreT);
    EXPECT_EQ(cache_after != cache, estimates) << "frame " << i;
  }
}

// Stage by stage with the exported functions, in the format's layout, then in the NV21 layout.
TEST(FrameDriver, PlanarOnEstimateFramesNv21OnReuseFrames) {
  constexpr int kWidth = 160;
  constexpr int kHeight = 128;
  Random random(test_seed());
  for (const int format : kFormats) {
    SessionPair sessions;
    sessions.init(format, kWidth, kHeight);
    const std::vector<uint8_t> first = make_hazy_frame(random, kWidth, kHeight);
    const std::vector<uint8_t> recovered = sessions.remove_haze(first, kWidth, kHeight, 90);
    std::vector<uint8_t> codes = cached_map(kWidth, kHeight);
    std::vector<uint8_t> planar = first;
    std::vector<uint8_t> nv21 = first;
    HazeRemoving3Preview(planar.data(), codes.data(), gPreAA, kWidth, kHeight, 0);
    HazeRemoving3Preview_NV21(nv21.data(), codes.data(), gPreAA, kWidth, kHeight, 0);
    ASSERT_NE(planar, nv21);
    EXPECT_TRUE(bytes_match(recovered, format == 3 ? planar : nv21, {{"format", format}}));

    const std::vector<uint8_t> second = make_hazy_frame(random, kWidth, kHeight);
    nv21 = second;
    HazeRemoving3Preview_NV21(nv21.data(), codes.data(), gPreAA, kWidth, kHeight, 0);
    EXPECT_TRUE(bytes_match(sessions.remove_haze(second, kWidth, kHeight, 90), nv21,
                            {{"reuse, format", format}}));
  }
}

// The maps in the block, computed again with the exported functions from the block's own inputs.
TEST(FrameDriver, StagesInTheWorkingBlock) {
  constexpr int kWidth = 192;
  constexpr int kHeight = 160;
  constexpr int kHalfWidth = kWidth / 2;
  constexpr int kHalfHeight = kHeight / 2;
  const reference::BlockRegions at(kWidth, kHeight);
  EXPECT_EQ(at.min_map, static_cast<size_t>(3 * kHalfWidth * kHalfHeight));
  EXPECT_EQ(at.box_scratch, 2 * at.min_map);
  Random random(test_seed());
  SessionPair sessions;
  sessions.init(0, kWidth, kHeight);
  std::vector<uint8_t> frame = make_hazy_frame(random, kWidth, kHeight);
  // dehazeLevel 117 is a strength of exactly 7, level 0 one of 0.
  EXPECT_EQ(reference::strength_of_level(117), 7.0f);
  EXPECT_EQ(reference::strength_of_level(0), 0.0f);
  EXPECT_EQ(reference::strength_of_level(-117), -7.0f);
  for (const int level : {117, 0, -117}) {
    sessions.set_frame_number(0);
    sessions.remove_haze(frame, kWidth, kHeight, level);
    std::vector<uint8_t> min_map(at.map_bytes);
    std::vector<uint8_t> max_map(at.map_bytes);
    xYCrCb2BGRMaxMinPreviewNeon_NV21(frame.data(), frame.data() + kWidth * kHeight, min_map.data(),
                                     max_map.data(), kWidth, kHeight);
    EXPECT_TRUE(bytes_match({gHazePreviewMemory + at.min_map, at.map_bytes}, min_map));
    std::vector<uint8_t> mean_map(at.map_bytes);
    std::vector<short> scratch(kHalfWidth);
    AverageFilterShort64_u8(min_map.data(), mean_map.data(), kHalfWidth, kHalfHeight, 30,
                            scratch.data());
    EXPECT_TRUE(bytes_match({gHazePreviewMemory + at.mean_map, at.map_bytes}, mean_map));
    const int light =
        reference::sample_light(max_map.data(), mean_map.data(), kHalfWidth, kHalfHeight);
    EXPECT_TRUE(all_bytes_are({gPreAA, 3}, static_cast<uint8_t>(light)));
    std::vector<uint8_t> codes(at.map_bytes);
    CalculateTChannelPreviewNeonFloat(mean_map.data(), min_map.data(), codes.data(), kHalfWidth,
                                      kHalfHeight, static_cast<float>(level / 117 * 7),
                                      1.0f / static_cast<float>(light));
    EXPECT_TRUE(bytes_match({gHazePreviewMemory + at.max_map, at.map_bytes}, codes));
    EXPECT_TRUE(bytes_match(cached_map(kWidth, kHeight), codes));
    EXPECT_TRUE(all_bytes_are({gHazePreviewMemory, at.min_map}, 0));
  }
}

// A black frame gives A = 0 and no number anywhere: code 0 in groups of eight, 40 in the tail.
TEST(FrameDriver, BlackFrameHasNoLight) {
  for (const int width : {128, 130}) {
    SessionPair sessions;
    sessions.init(0, width, 130);
    sessions.remove_haze(black_frame(width, 130), width, 130, 100);
    EXPECT_TRUE(all_bytes_are({gPreAA, 3}, 0));
    std::vector<uint8_t> want(static_cast<size_t>(width / 2 * 65), 0);
    for (size_t i = want.size() / 8 * 8; i < want.size(); ++i) want[i] = 40;
    EXPECT_TRUE(bytes_match(cached_map(width, 130), want, {{"width", width}}));
    sessions.remove_haze(black_frame(width, 130), width, 130, 100);
  }
}

// Only blocks off the sampling grid are lit, so lightly that the means stay at 1 or below: A = 0
// with pixels whose scaled mean is above and below 0.
TEST(FrameDriver, NoLightOnTheGrid) {
  for (const int level : {-50, 0, 40, 250}) {
    SessionPair sessions;
    sessions.init(3, 256, 192);
    std::vector<uint8_t> frame = black_frame(256, 192);
    for (int row = 0; row < 96; ++row)
      for (int column = 1; column < 128; column += 2) set_luma_of_block(frame, 256, row, column, 2);
    set_luma_of_block(frame, 256, 21, 33, 255);
    sessions.remove_haze(frame, 256, 192, level);
    EXPECT_TRUE(all_bytes_are({gPreAA, 3}, 0)) << level;
    const std::vector<uint8_t> codes = cached_map(256, 192);
    const auto holds = [&codes](int code) {
      return std::find(codes.begin(), codes.end(), code) != codes.end();
    };
    EXPECT_TRUE(holds(0));
    EXPECT_EQ(holds(40), level > 0);
    EXPECT_EQ(holds(158), level < 0);
    sessions.remove_haze(frame, 256, 192, level);
  }
}

// The grid of a 65 x 64 map starts one byte further right in every further sampled row.
TEST(FrameDriver, OddHalfWidthDriftsToTheRight) {
  constexpr int kWidth = 130;
  const struct {
    int row;
    int column;
    bool sampled;
  } cases[] = {{0, 0, true},   {0, 1, false},   {0, 64, true},  {2, 0, false},
               {2, 1, true},   {2, 2, false},   {2, 63, true},  {3, 0, true},
               {3, 1, false},  {4, 2, true},    {4, 1, false},  {5, 1, true},
               {62, 31, true}, {62, 30, false}, {63, 30, true}, {1, 0, false}};
  for (const auto& test : cases) {
    SessionPair sessions;
    sessions.init(0, kWidth, 128);
    std::vector<uint8_t> frame = black_frame(kWidth, 128);
    set_luma_of_block(frame, kWidth, test.row, test.column, 200);
    sessions.remove_haze(frame, kWidth, 128, 100);
    EXPECT_EQ(gPreAA[0], test.sampled ? 100 : 0) << test.row << ", " << test.column;
  }
}

// With drift the last samples come from the means and the column sums behind the maps; with 359
// half rows they go past the 65 column sums, into bytes that no frame of this size writes.
TEST(FrameDriver, OddHalfWidths) {
  const int sizes[][2] = {{130, 128},  {130, 130}, {134, 262}, {130, 718},
                          {1278, 718}, {202, 306}, {642, 482}};
  Random random(test_seed());
  for (const auto& size : sizes)
    for (const Mood mood : {Mood::kNoise, Mood::kBlocks, Mood::kGradient, Mood::kNearMaximum}) {
      SessionPair sessions;
      sessions.init(0, size[0], size[1]);
      sessions.remove_haze(make_frame(random, mood, Colours::kMuted, size[0], size[1]), size[0],
                           size[1], random.one_of(kLevels));
    }
}

// Never-written bytes behind the column sums are what the host put there, if the block is the
// host's.
TEST(FrameDriver, DriftReadsWhatTheHostsBlockHolds) {
  constexpr int kWidth = 130;
  constexpr int kHeight = 718;
  const std::vector<uint8_t> frame = black_frame(kWidth, kHeight);
  for (const uint8_t fill : {uint8_t{0}, uint8_t{60}, uint8_t{255}}) {
    SessionPair sessions;
    sessions.supply_block(std::vector<uint8_t>(kWidth * kHeight * 4, fill));
    sessions.init(0, 1, 1);
    sessions.remove_haze(frame, kWidth, kHeight, 100);
    // The maximum's last samples are means, which are 0; those of the mean end 178 bytes past its
    // map.
    EXPECT_EQ(gPreAA[0], fill / 2);
  }
}

TEST(FrameDriver, LevelsOfEverySign) {
  Random random(test_seed());
  for (const int format : {0, 3})
    for (const int level :
         {-1000000, -50, -1, 0, 1, 16, 17, 40, 100, 117, 250, 5000, INT_MAX, INT_MIN}) {
      SessionPair sessions;
      sessions.init(format, 128, 128);
      const std::vector<uint8_t> frame = make_hazy_frame(random, 128, 128);
      sessions.remove_haze(frame, 128, 128, level);
      EXPECT_GT(gPreAA[0], 0);
      if (level <= 0) {
        EXPECT_TRUE(all_bytes_are(cached_map(128, 128), 158, {{"level", level}}));
      }
      sessions.remove_haze(frame, 128, 128, level);
    }
}

// A flat view with one bright block on the grid: the smoothed minimum stays the background and
// A = (bright + background) / 2. In the first cases level / 117 * 7 would give the bright block one
// code less, in the others strength * background / A one less or more.
TEST(FrameDriver, RoundsLevelAndInverseLightInOrder) {
  const struct {
    int level;
    int background;
    int bright;
    int code;
  } cases[] = {{4, 117, 163, 120}, {8, 117, 233, 96}, {15, 39, 101, 60}, {39, 3, 25, 60},
               {39, 18, 192, 80},  {9, 39, 61, 76},   {9, 39, 73, 84},   {9, 78, 122, 76}};
  for (const auto& test : cases) {
    SessionPair sessions;
    sessions.init(0, 128, 128);
    std::vector<uint8_t> frame = black_frame(128, 128);
    std::fill_n(frame.begin(), 128 * 128, static_cast<uint8_t>(test.background));
    set_luma_of_block(frame, 128, 20, 30, static_cast<uint8_t>(test.bright));
    sessions.remove_haze(frame, 128, 128, test.level);
    EXPECT_EQ(gPreAA[0], (test.background + test.bright) / 2);
    EXPECT_EQ(gPreT[20 * 640 + 30], test.code) << test.level << ", " << test.background;
  }
}

TEST(FrameDriver, MoodsAndColours) {
  Random random(test_seed());
  const int sizes[][2] = {{128, 128}, {146, 160}, {240, 136}};
  for (const auto& size : sizes)
    for (const Mood mood : kMoods)
      for (const Colours colours : {Colours::kWild, Colours::kMuted}) {
        SessionPair sessions;
        sessions.init(random.one_of(kFormats), size[0], size[1]);
        for (int i = 0; i < 2; ++i)
          sessions.remove_haze(make_frame(random, mood, colours, size[0], size[1]), size[0],
                               size[1], random.one_of(kLevels));
      }
}

TEST(FrameDriver, RecoverArgumentHasNoEffect) {
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, 128, 128);
  for (const int recover_arg : {0, 1, -1, 255, INT_MAX, INT_MIN}) {
    SessionPair sessions;
    sessions.init(3, 128, 128);
    sessions.remove_haze(frame, 128, 128, 80, recover_arg);
    sessions.remove_haze(frame, 128, 128, 80, recover_arg);
  }
}

TEST(FrameDriver, LargestFrameFillsTheCache) {
  Random random(test_seed());
  SessionPair sessions;
  sessions.init(0, 1280, 720);
  sessions.remove_haze(make_hazy_frame(random, 1280, 720), 1280, 720, 117);
  EXPECT_TRUE(bytes_match({gPreT, sizeof gPreT}, cached_map(1280, 720)));
  for (const unsigned char code : gPreT) ASSERT_TRUE(code >= 40 && code <= 158);
  sessions.remove_haze(make_hazy_frame(random, 1280, 720), 1280, 720, 117);
}

TEST(FrameDriver, CacheBytesBesideTheMapStay) {
  Random random(test_seed());
  SessionPair sessions;
  std::fill(gPreT, gPreT + sizeof gPreT, uint8_t{0xEE});
  InitHazePreviewFormat(kInputFormatNv21, 640, 480);
  std::vector<uint8_t> frame = make_hazy_frame(random, 640, 480);
  RemoveHazePreview(frame.data(), 640, 480, 0, 100);
  for (int row = 0; row < 360; ++row)
    for (int column = 0; column < 640; ++column)
      ASSERT_EQ(gPreT[row * 640 + column] == 0xEE, row >= 240 || column >= 320)
          << row << ", " << column;
}

// Any counter but 0 reuses; the new value is the signed remainder of value + 1 by 2.
TEST(FrameDriver, CountersOtherThan0And1) {
  const struct {
    int before;
    int after;
  } cases[] = {{1, 0},   {2, 1},  {3, 0},   {5, 0},        {100, 1},     {-1, 0},
               {-2, -1}, {-3, 0}, {-4, -1}, {INT_MIN, -1}, {INT_MAX, 0}, {INT_MAX - 1, 1}};
  Random random(test_seed());
  SessionPair sessions;
  sessions.init(3, 128, 128);
  for (const auto& test : cases) {
    sessions.set_frame_number(test.before);
    const std::vector<uint8_t> cache(gPreT, gPreT + sizeof gPreT);
    sessions.remove_haze(make_hazy_frame(random, 128, 128), 128, 128, 100);
    EXPECT_EQ(gPreFrameNum, test.after) << test.before;
    EXPECT_TRUE(bytes_match({gPreT, sizeof gPreT}, cache));
  }
}

// A reuse frame of another size takes the cache at the same stride.
TEST(FrameDriver, ReuseAfterASizeChange) {
  Random random(test_seed());
  SessionPair sessions;
  sessions.init(0, 640, 480);
  sessions.remove_haze(make_hazy_frame(random, 320, 240), 320, 240, 100);
  sessions.remove_haze(make_hazy_frame(random, 640, 480), 640, 480, 100);
  sessions.remove_haze(make_hazy_frame(random, 640, 480), 640, 480, 100);
  sessions.remove_haze(make_hazy_frame(random, 128, 200), 128, 200, 100);
}

// The light of a reuse frame is the cached one, whoever wrote it.
TEST(FrameDriver, ReuseTakesCodesAndLightFromTheCache) {
  Random random(test_seed());
  InitHazePreviewFormat(kInputFormatPlanar, 128, 128);
  for (unsigned char& code : gPreT) code = random.byte();
  const unsigned char light[3] = {200, 150, 90};
  std::copy(light, light + 3, gPreAA);
  gPreFrameNum = 1;
  const std::vector<uint8_t> frame = make_hazy_frame(random, 128, 128);
  std::vector<uint8_t> want = frame;
  std::vector<uint8_t> codes = cached_map(128, 128);
  HazeRemoving3Preview_NV21(want.data(), codes.data(), gPreAA, 128, 128, 0);
  GuardedBuffer<uint8_t> actual(frame);
  RemoveHazePreview(actual.data(), 128, 128, 0, 100);
  EXPECT_TRUE(bytes_match(actual, want));
  EXPECT_TRUE(bytes_match(cached_map(128, 128), codes));
  EXPECT_TRUE(bytes_match({gPreAA, 3}, {light, 3}));
  reset_library_session();
}

// Whatever is kept between frames for speed must follow the cache: lights that change and come
// back, codes that a frame needs for the first time, and codes that the estimate never gives.
TEST(FrameDriver, ReuseFollowsEveryChangeOfTheCache) {
  constexpr uint8_t kLights[][3] = {{200, 200, 200}, {0, 0, 0},    {200, 200, 200}, {201, 200, 199},
                                    {199, 200, 201}, {23, 23, 23}, {22, 22, 22},    {23, 23, 23}};
  constexpr int kCodeRanges[][2] = {{40, 60}, {140, 158}, {0, 255}, {100, 100}};
  Random random(test_seed());
  InitHazePreviewFormat(kInputFormatNv21, 128, 128);
  for (const auto& range : kCodeRanges)
    for (const auto& light : kLights) {
      for (unsigned char& code : gPreT)
        code = static_cast<uint8_t>(random.between(range[0], range[1]));
      std::copy(light, light + 3, gPreAA);
      gPreFrameNum = 1;
      const std::vector<uint8_t> frame = make_frame(random, Mood::kNoise, Colours::kWild, 128, 128);
      std::vector<uint8_t> want = frame;
      reference::recover_nv21(want.data(), cached_map(128, 128).data(), light, 128, 128);
      std::vector<uint8_t> actual = frame;
      RemoveHazePreview(actual.data(), 128, 128, 0, 100);
      EXPECT_TRUE(bytes_match(actual, want, {{"light", light[0]}, {"first code", range[0]}}));
    }
  reset_library_session();
}

// Recovery on threads of its own shares nothing with the session's frames.
TEST(FrameDriver, RecoveryOnOtherThreadsBesideTheSession) {
  constexpr int kSize = 128;
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, kSize, kSize);
  std::vector<uint8_t> codes = make_image(random, Mood::kNoise, kSize / 2, kSize / 2);
  for (uint8_t& code : codes) code = static_cast<uint8_t>(40 + code % 119);
  const auto recover_repeatedly = [&](int level) {
    const uint8_t light[3] = {static_cast<uint8_t>(level), 180, 200};
    std::vector<uint8_t> want = frame;
    reference::recover_planar(want.data(), codes.data(), light, kSize, kSize);
    for (int i = 0; i < 8; ++i) {
      std::vector<uint8_t> actual = frame;
      uint8_t light_bgr[3] = {light[0], light[1], light[2]};
      std::vector<uint8_t> map = codes;
      HazeRemoving3Preview(actual.data(), map.data(), light_bgr, kSize, kSize, 0);
      EXPECT_TRUE(bytes_match(actual, want, {{"blue", level}}));
    }
  };
  SessionPair sessions;
  sessions.init(3, kSize, kSize);
  std::thread first(recover_repeatedly, 90);
  std::thread second(recover_repeatedly, 210);
  for (int i = 0; i < 8; ++i) sessions.remove_haze(frame, kSize, kSize, 30 * i);
  first.join();
  second.join();
}

TEST(FrameDriver, TwoBufferOverloadDoesNothing) {
  Random random(test_seed());
  const std::vector<uint8_t> content = make_hazy_frame(random, 128, 128);
  SessionPair sessions;
  for (const bool open : {false, true}) {
    if (open) sessions.init(0, 128, 128);
    GuardedBuffer<uint8_t> source(content);
    GuardedBuffer<uint8_t> destination(content.size(), 0xA5);
    RemoveHazePreview(source.data(), destination.data(), 128, 128);
    RemoveHazePreview(nullptr, nullptr, 128, 128);
    RemoveHazePreview(nullptr, nullptr, -1, INT_MAX);
    EXPECT_TRUE(bytes_match(source, content));
    EXPECT_TRUE(all_bytes_are(destination, 0xA5));
    sessions.expect_equal_state("the two-buffer overload");
  }
}

}  // namespace
}  // namespace haze::test
