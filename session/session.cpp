// The library's one session: its globals, and the entry points of a camera pipeline.
#include <stdlib.h>
#include <string.h>

#include "core/numeric.h"
#include "haze_preview.h"
#include "session/frame_driver.h"

INPUT_FORMAT gPerviewFormat = kInputFormatPlanar;
unsigned char* gHazePreviewMemory;
unsigned char gPreT[640 * 360];
unsigned char gPreAA[3];
int gPreFrameNum;

namespace {

using haze::session::kMostHeight;
using haze::session::kMostWidth;
using haze::session::StreamState;
using haze::session::WorkingMemory;

// The block that this session allocated; a block that the host put in is another one.
struct OwnBlock {
  const unsigned char* address;
  size_t bytes;
};
OwnBlock own_block;

haze::recover::KeptTables kept_tables;

size_t known_block_bytes() {
  return gHazePreviewMemory == own_block.address ? own_block.bytes : SIZE_MAX;
}

static_assert(sizeof gPreT == haze::session::kCacheRowBytes * kMostHeight / 2);

}  // namespace

void InitHazePreviewFormat(INPUT_FORMAT format, int width, int height) {
  gPerviewFormat = format;
  if (gHazePreviewMemory != nullptr) return;
  // The product wraps in 32 bits, and a negative one asks malloc for more than there is.
  const int product =
      static_cast<int>(static_cast<unsigned>(width) * static_cast<unsigned>(height) * 4u);
  const size_t bytes = static_cast<size_t>(product);
  gHazePreviewMemory = static_cast<unsigned char*>(malloc(bytes));
  if (gHazePreviewMemory == nullptr) return;
  // With an odd half size the scan for the light may read scratch bytes that no stage writes. They
  // are zero, so that results do not depend on what the heap held. No frame reaches further than
  // the largest one does.
  memset(gHazePreviewMemory, 0, haze::min(bytes, WorkingMemory::bytes(kMostWidth, kMostHeight)));
  own_block = {gHazePreviewMemory, bytes};
}

void ReleaseHazePreview() {
  if (gHazePreviewMemory == own_block.address) own_block = {};
  free(gHazePreviewMemory);
  gHazePreviewMemory = nullptr;
}

void RemoveHazePreview(unsigned char* frame, int width, int height, int /*recoverArg*/,
                       int dehazeLevel) {
  StreamState stream = {gPerviewFormat, gHazePreviewMemory, known_block_bytes(), gPreT,
                        gPreAA,         &gPreFrameNum,      &kept_tables};
  haze::session::process_frame(stream, frame, width, height, dehazeLevel);
}

void RemoveHazePreview(unsigned char* /*source*/, unsigned char* /*destination*/, int /*width*/,
                       int /*height*/) {}
