#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <cstring>
#include <vector>

#include "haze_preview.h"
#include "tests/support/bytes_match.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

// Taken before main() and thus before any test of this program changes the session.
struct LoadedState {
  LoadedState()
      : format(static_cast<int>(gPerviewFormat)),
        has_block(gHazePreviewMemory != nullptr),
        frame_number(gPreFrameNum),
        cache_is_zero(std::all_of(gPreT, gPreT + sizeof gPreT, [](int byte) { return byte == 0; })),
        light_is_zero(gPreAA[0] == 0 && gPreAA[1] == 0 && gPreAA[2] == 0) {}

  int format;
  bool has_block;
  int frame_number;
  bool cache_is_zero;
  bool light_is_zero;
};

const LoadedState kLoaded;

class Session : public ::testing::Test {
 protected:
  Session() { reset_library_session(); }
  ~Session() override { reset_library_session(); }
};

TEST_F(Session, StateAfterLoading) {
  EXPECT_EQ(kLoaded.format, 3);
  EXPECT_FALSE(kLoaded.has_block);
  EXPECT_EQ(kLoaded.frame_number, 0);
  EXPECT_TRUE(kLoaded.cache_is_zero);
  EXPECT_TRUE(kLoaded.light_is_zero);
}

TEST_F(Session, TypesAndSizes) {
  EXPECT_EQ(sizeof(INPUT_FORMAT), 4u);
  EXPECT_EQ(sizeof gPreT, 230400u);
  EXPECT_EQ(sizeof gPreAA, 3u);
  EXPECT_EQ(static_cast<int>(kInputFormatNv21), 0);
  EXPECT_EQ(static_cast<int>(kInputFormatPlanar), 3);
}

// The sanitizer and the heap's own checks see to it that the block is not shorter.
TEST_F(Session, BlockHoldsFourBytesPerPixel) {
  InitHazePreviewFormat(kInputFormatNv21, 130, 128);
  ASSERT_NE(gHazePreviewMemory, nullptr);
  constexpr size_t kBytes = 130 * 128 * 4;
  EXPECT_TRUE(all_bytes_are({gHazePreviewMemory, kBytes}, 0));
  std::memset(gHazePreviewMemory, 0xA5, kBytes);
  EXPECT_TRUE(all_bytes_are({gHazePreviewMemory, kBytes}, 0xA5));
  ReleaseHazePreview();
  EXPECT_EQ(gHazePreviewMemory, nullptr);
}

TEST_F(Session, StoresEveryFormat) {
  for (const int format : {0, 1, 2, 3, 4, -1, 0x7fffffff, INT_MIN, 3, 0}) {
    InitHazePreviewFormat(static_cast<INPUT_FORMAT>(format), 128, 128);
    EXPECT_EQ(static_cast<int>(gPerviewFormat), format);
  }
}

TEST_F(Session, SecondInitOnlyChangesTheFormat) {
  InitHazePreviewFormat(kInputFormatPlanar, 128, 128);
  unsigned char* const block = gHazePreviewMemory;
  std::memset(block, 0x3C, 128 * 128 * 4);
  InitHazePreviewFormat(kInputFormatNv21, 1280, 720);
  EXPECT_EQ(gPerviewFormat, kInputFormatNv21);
  EXPECT_EQ(gHazePreviewMemory, block);
  EXPECT_TRUE(all_bytes_are({block, 128 * 128 * 4}, 0x3C));
  // The block has still its first size, so a larger frame is refused.
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, 160, 128);
  std::vector<uint8_t> actual = frame;
  RemoveHazePreview(actual.data(), 160, 128, 0, 100);
  EXPECT_TRUE(bytes_match(actual, frame));
  EXPECT_EQ(gPreFrameNum, 0);
  EXPECT_TRUE(all_bytes_are({block, 128 * 128 * 4}, 0x3C));
}

TEST_F(Session, ReleaseWithoutASessionDoesNothing) {
  ReleaseHazePreview();
  EXPECT_EQ(gHazePreviewMemory, nullptr);
  InitHazePreviewFormat(kInputFormatNv21, 128, 128);
  ReleaseHazePreview();
  ReleaseHazePreview();
  EXPECT_EQ(gHazePreviewMemory, nullptr);
  EXPECT_EQ(gPerviewFormat, kInputFormatNv21);
}

TEST_F(Session, ReleaseKeepsFormatCacheAndCounter) {
  InitHazePreviewFormat(static_cast<INPUT_FORMAT>(4), 128, 128);
  std::memset(gPreT, 77, sizeof gPreT);
  std::memset(gPreAA, 88, sizeof gPreAA);
  gPreFrameNum = 1;
  ReleaseHazePreview();
  InitHazePreviewFormat(static_cast<INPUT_FORMAT>(4), 640, 480);
  EXPECT_EQ(static_cast<int>(gPerviewFormat), 4);
  EXPECT_TRUE(all_bytes_are({gPreT, sizeof gPreT}, 77));
  EXPECT_TRUE(all_bytes_are({gPreAA, sizeof gPreAA}, 88));
  EXPECT_EQ(gPreFrameNum, 1);
}

TEST_F(Session, NewSessionReusesTheCacheOfTheLastOne) {
  SessionPair sessions;
  Random random(test_seed());
  sessions.init(0, 128, 128);
  sessions.remove_haze(make_hazy_frame(random, 128, 128), 128, 128, 100);
  EXPECT_EQ(gPreFrameNum, 1);
  sessions.release();
  sessions.init(0, 128, 128);
  const std::vector<uint8_t> cache(gPreT, gPreT + sizeof gPreT);
  sessions.remove_haze(make_hazy_frame(random, 128, 128), 128, 128, 100);
  EXPECT_EQ(gPreFrameNum, 0);
  EXPECT_TRUE(bytes_match({gPreT, sizeof gPreT}, cache));
}

TEST_F(Session, ReleaseFreesABlockOfTheHost) {
  SessionPair sessions;
  sessions.supply_block(std::vector<uint8_t>(128 * 128 * 4, 1));
  sessions.init(0, 1280, 720);
  sessions.release();
  EXPECT_EQ(gHazePreviewMemory, nullptr);
}

// Whatever such sizes allocate, no frame fits, and a proper session can be opened afterwards.
TEST_F(Session, EmptyAndNegativeSizesHoldNoFrame) {
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, 128, 128);
  const int sizes[][2] = {{0, 0}, {0, 128}, {128, 0}, {-1, 1}, {-128, 128}, {128, -128}, {1, 1}};
  for (const auto& size : sizes) {
    InitHazePreviewFormat(kInputFormatNv21, size[0], size[1]);
    std::vector<uint8_t> actual = frame;
    RemoveHazePreview(actual.data(), 128, 128, 0, 100);
    EXPECT_TRUE(bytes_match(actual, frame, {{"width", size[0]}, {"height", size[1]}}));
    EXPECT_EQ(gPreFrameNum, 0);
    ReleaseHazePreview();
    EXPECT_EQ(gHazePreviewMemory, nullptr);
  }
  InitHazePreviewFormat(kInputFormatNv21, 128, 128);
  ASSERT_NE(gHazePreviewMemory, nullptr);
  std::vector<uint8_t> actual = frame;
  RemoveHazePreview(actual.data(), 128, 128, 0, 100);
  EXPECT_EQ(gPreFrameNum, 1);
  EXPECT_NE(actual, frame);
}

// An allocation that fails leaves the session closed and the next call tries again.
TEST_F(Session, FailedAllocationIsTriedAgain) {
  InitHazePreviewFormat(kInputFormatNv21, -1, 1);
  EXPECT_EQ(gHazePreviewMemory, nullptr);
  InitHazePreviewFormat(kInputFormatPlanar, 128, 128);
  ASSERT_NE(gHazePreviewMemory, nullptr);
  EXPECT_EQ(gPerviewFormat, kInputFormatPlanar);
}

}  // namespace
}  // namespace haze::test
