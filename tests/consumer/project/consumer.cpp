// The README's example: a grey NV21 frame through one session.
#include <haze_preview.h>

#include <cstdio>
#include <vector>

int main() {
  const int width = 640, height = 480, level = 10;
  std::vector<unsigned char> frame(width * height * 3 / 2, 128);

  InitHazePreviewFormat(kInputFormatNv21, width, height);
  RemoveHazePreview(frame.data(), width, height, 0, level);  // in place, once per frame
  ReleaseHazePreview();

  std::printf("haze_preview %s: luma 128 is now %d\n", HAZE_PREVIEW_VERSION_STRING, frame[0]);
}
