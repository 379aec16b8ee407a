// The frame path when memory is short.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/faults/fault_points.h"
#include "tests/support/moods.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

TEST(SessionFaults, AFailedInitLeavesTheSessionClosed) {
  SessionPair sessions;
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, 128, 128);
  arm_faults({0}, {});
  InitHazePreviewFormat(kInputFormatNv21, 128, 128);
  const FaultCounts counts = disarm_faults();
  EXPECT_EQ(counts.allocations, 1);
  EXPECT_EQ(counts.live, 0);
  EXPECT_EQ(gHazePreviewMemory, nullptr);
  EXPECT_EQ(gPerviewFormat, kInputFormatNv21);
  std::vector<uint8_t> refused = frame;
  RemoveHazePreview(refused.data(), 128, 128, 0, 100);
  EXPECT_EQ(refused, frame);
  // A later call tries again.
  sessions.init(0, 128, 128);
  EXPECT_NE(sessions.remove_haze(frame, 128, 128, 100), frame);
}

TEST(SessionFaults, OneBlockFromInitToRelease) {
  arm_faults({}, {});
  for (int i = 0; i < 3; ++i) InitHazePreviewFormat(kInputFormatPlanar, 640, 480);
  FaultCounts counts = disarm_faults();
  EXPECT_EQ(counts.allocations, 1);
  EXPECT_EQ(counts.live, 1);
  ReleaseHazePreview();
  arm_faults({}, {});
  InitHazePreviewFormat(kInputFormatPlanar, 640, 480);
  ReleaseHazePreview();
  counts = disarm_faults();
  EXPECT_EQ(counts.allocations, 1);
  EXPECT_EQ(counts.live, 0);
}

TEST(SessionFaults, FramesAllocateNothingAndStartNoThread) {
  Random random(test_seed());
  reset_library_session();
  InitHazePreviewFormat(kInputFormatNv21, 1280, 720);
  for (const int width : {128, 642, 1280}) {
    std::vector<uint8_t> frame = make_hazy_frame(random, width, 360);
    arm_faults({0, true}, {0, true});
    for (int i = 0; i < 4; ++i) RemoveHazePreview(frame.data(), width, 360, 0, 100);
    const FaultCounts counts = disarm_faults();
    EXPECT_EQ(counts.allocations, 0);
    EXPECT_EQ(counts.threads, 0);
  }
  reset_library_session();
}

}  // namespace
}  // namespace haze::test
