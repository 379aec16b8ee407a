#include "tests/support/session_pair.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"

namespace haze::test {

void reset_library_session() {
  ReleaseHazePreview();
  gPerviewFormat = kInputFormatPlanar;
  std::memset(gPreT, 0, sizeof gPreT);
  std::memset(gPreAA, 0, sizeof gPreAA);
  gPreFrameNum = 0;
}

SessionPair::SessionPair() {
  reset_library_session();
  for (size_t i = 0; i < reference_.cache.size(); ++i)
    reference_.cache[i] = static_cast<uint8_t>(40 + i % 119);
  std::copy(reference_.cache.begin(), reference_.cache.end(), gPreT);
}

SessionPair::~SessionPair() { reset_library_session(); }

void SessionPair::init(int format, int width, int height) {
  InitHazePreviewFormat(static_cast<INPUT_FORMAT>(format), width, height);
  reference_.init(format, width, height);
  expect_equal_state("InitHazePreviewFormat");
}

void SessionPair::release() {
  ReleaseHazePreview();
  reference_.release();
  expect_equal_state("ReleaseHazePreview");
}

void SessionPair::set_frame_number(int value) {
  gPreFrameNum = value;
  reference_.frame_number = value;
}

void SessionPair::supply_block(const std::vector<uint8_t>& bytes) {
  gHazePreviewMemory = static_cast<unsigned char*>(std::malloc(bytes.size()));
  ASSERT_NE(gHazePreviewMemory, nullptr);
  std::copy(bytes.begin(), bytes.end(), gHazePreviewMemory);
  reference_.adopt_block(bytes);
}

std::vector<uint8_t> SessionPair::remove_haze(const std::vector<uint8_t>& frame, int width,
                                              int height, int level, int recover_arg) {
  std::vector<uint8_t> want = frame;
  reference_.remove_haze(want.data(), width, height, level);
  GuardedBuffer<uint8_t> actual(frame);
  RemoveHazePreview(actual.data(), width, height, recover_arg, level);
  EXPECT_TRUE(bytes_match(actual, want,
                          {{"width", width},
                           {"height", height},
                           {"level", level},
                           {"format", reference_.format},
                           {"counter after", reference_.frame_number},
                           {"row", width > 0 ? width : 0}}));
  expect_equal_state("RemoveHazePreview");
  return {actual.data(), actual.data() + actual.size()};
}

void SessionPair::expect_equal_state(const char* after) const {
  EXPECT_EQ(static_cast<int>(gPerviewFormat), reference_.format) << after;
  EXPECT_EQ(gPreFrameNum, reference_.frame_number) << after;
  EXPECT_TRUE(bytes_match({gPreAA, sizeof gPreAA}, reference_.light)) << after;
  EXPECT_TRUE(bytes_match({gPreT, sizeof gPreT}, reference_.cache, {{"row", 640}})) << after;
  EXPECT_EQ(gHazePreviewMemory != nullptr, reference_.open) << after;
  if (gHazePreviewMemory != nullptr && reference_.open) {
    // No frame reaches further, and what lies behind is as the heap left it.
    const size_t reach = std::min(reference_.block.size(), size_t{1280 * 720 * 4});
    EXPECT_TRUE(bytes_match({gHazePreviewMemory, reach}, {reference_.block.data(), reach}))
        << after << ", working block";
  }
}

}  // namespace haze::test
