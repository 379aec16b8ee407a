// Frames that are answered by leaving frame, cache, light, counter and working block as they are.
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <cstdlib>
#include <vector>

#include "haze_preview.h"
#include "tests/support/bytes_match.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

// Bytes enough for every size near the limits.
const std::vector<uint8_t>& large_frame() {
  static const std::vector<uint8_t> frame = [] {
    Random random(test_seed());
    return make_hazy_frame(random, 1300, 740);
  }();
  return frame;
}

// Both kinds of frame; the reference refuses by the same limits, and here it must.
void expect_refused(SessionPair& sessions, int width, int height) {
  EXPECT_FALSE(sessions.reference().accepts(width, height)) << width << " x " << height;
  for (const int counter : {0, 1, 7, -2}) {
    sessions.set_frame_number(counter);
    EXPECT_TRUE(bytes_match(sessions.remove_haze(large_frame(), width, height, 100), large_frame(),
                            {{"width", width}, {"height", height}, {"counter", counter}}));
    EXPECT_EQ(gPreFrameNum, counter);
  }
}

void expect_processed(SessionPair& sessions, int width, int height) {
  EXPECT_TRUE(sessions.reference().accepts(width, height)) << width << " x " << height;
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, width, height);
  sessions.set_frame_number(0);
  for (int i = 0; i < 2; ++i)
    EXPECT_NE(sessions.remove_haze(frame, width, height, 100), frame) << width << " x " << height;
}

TEST(FrameGuards, NoSession) {
  SessionPair sessions;
  expect_refused(sessions, 128, 128);
  sessions.init(0, 128, 128);
  sessions.release();
  expect_refused(sessions, 128, 128);
  expect_refused(sessions, 1280, 720);
}

TEST(FrameGuards, OddSizes) {
  SessionPair sessions;
  sessions.init(0, 1280, 720);
  const int sizes[][2] = {{129, 128}, {128, 129}, {129, 129}, {1279, 720}, {1280, 719}, {641, 480}};
  for (const auto& size : sizes) expect_refused(sessions, size[0], size[1]);
}

TEST(FrameGuards, SmallSizes) {
  SessionPair sessions;
  sessions.init(3, 1280, 720);
  const int sizes[][2] = {{127, 128},     {128, 127},     {126, 128},   {128, 126},  {126, 720},
                          {1280, 126},    {2, 2},         {1, 1},       {0, 0},      {0, 128},
                          {128, 0},       {-2, 128},      {128, -2},    {-128, 128}, {-128, -128},
                          {INT_MIN, 128}, {128, INT_MIN}, {-1280, -720}};
  for (const auto& size : sizes) expect_refused(sessions, size[0], size[1]);
  expect_processed(sessions, 128, 128);
}

TEST(FrameGuards, LargeSizes) {
  SessionPair sessions;
  sessions.init(0, 1300, 740);
  const int sizes[][2] = {{1282, 720},  {1280, 722},        {1282, 722},    {1281, 720},
                          {1280, 721},  {1300, 128},        {128, 740},     {INT_MAX - 1, 128},
                          {65536, 128}, {128, INT_MAX - 1}, {65536, 65536}, {INT_MAX, INT_MAX}};
  for (const auto& size : sizes) expect_refused(sessions, size[0], size[1]);
  expect_processed(sessions, 1280, 720);
}

TEST(FrameGuards, FramesLargerThanTheBlock) {
  SessionPair sessions;
  sessions.init(0, 256, 128);
  expect_refused(sessions, 258, 128);
  expect_refused(sessions, 256, 130);
  expect_refused(sessions, 1280, 720);
  // As many bytes in another shape, and fewer.
  expect_processed(sessions, 128, 256);
  expect_processed(sessions, 256, 128);
  expect_processed(sessions, 130, 128);
  sessions.release();
  sessions.init(0, 258, 128);
  expect_processed(sessions, 258, 128);
}

// An odd size may be given to open a session; its bytes decide.
TEST(FrameGuards, BlocksOfOddSizes) {
  SessionPair sessions;
  sessions.init(0, 16383, 1);
  expect_refused(sessions, 128, 128);
  sessions.release();
  sessions.init(0, 1, 16384);
  expect_processed(sessions, 128, 128);
}

TEST(FrameGuards, BlockOfTheHostIsTrusted) {
  SessionPair sessions;
  sessions.supply_block(std::vector<uint8_t>(640 * 480 * 4, 0x11));
  expect_processed(sessions, 640, 480);
  sessions.init(3, 128, 128);
  expect_processed(sessions, 640, 480);
  expect_refused(sessions, 641, 480);
  expect_refused(sessions, 126, 128);
  expect_refused(sessions, 1282, 720);
}

// The size of a released block says nothing about the host's own, even at the same address.
TEST(FrameGuards, BlockOfTheHostAfterASession) {
  for (int i = 0; i < 8; ++i) {
    SessionPair sessions;
    sessions.init(0, 128, 128);
    sessions.release();
    sessions.supply_block(std::vector<uint8_t>(128 * 130 * 4, 0x22));
    expect_processed(sessions, 128, 130);
    sessions.release();
    sessions.init(0, 128, 128);
    expect_refused(sessions, 128, 130);
  }
}

// Heaps tend to hand a block that was just freed out again, and then address and size disagree.
TEST(FrameGuards, BlockOfTheHostAtTheAddressOfAReleasedOne) {
  reset_library_session();
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, 128, 130);
  std::vector<uint8_t> actual = frame;
  InitHazePreviewFormat(kInputFormatNv21, 128, 128);
  ReleaseHazePreview();
  gHazePreviewMemory = static_cast<unsigned char*>(std::malloc(128 * 130 * 4));
  RemoveHazePreview(actual.data(), 128, 130, 0, 100);
  EXPECT_EQ(gPreFrameNum, 1);
  EXPECT_NE(actual, frame);
  reset_library_session();
}

// The host puts its block in the place of the session's, and frees that one itself.
TEST(FrameGuards, BlockOfTheHostWithinASession) {
  SessionPair sessions;
  sessions.init(0, 128, 128);
  unsigned char* const block = gHazePreviewMemory;
  sessions.supply_block(std::vector<uint8_t>(320 * 240 * 4, 0x33));
  std::free(block);
  expect_processed(sessions, 320, 240);
}

}  // namespace
}  // namespace haze::test
