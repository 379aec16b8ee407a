// Runs frames of 1280 x 720 and prints the peak resident memory of the process, all of the C
// library and the program itself included.
#include <sys/resource.h>

#include <cstdio>
#include <vector>

#include "haze_preview.h"

int main() {
  constexpr int kWidth = 1280;
  constexpr int kHeight = 720;
  std::vector<unsigned char> frame(kWidth * kHeight * 3 / 2);
  for (size_t i = 0; i < frame.size(); ++i) frame[i] = static_cast<unsigned char>(64 + i % 160);
  InitHazePreviewFormat(kInputFormatNv21, kWidth, kHeight);
  for (int i = 0; i < 10; ++i) RemoveHazePreview(frame.data(), kWidth, kHeight, 0, 50);
  ReleaseHazePreview();
  rusage usage = {};
  getrusage(RUSAGE_SELF, &usage);
  std::printf("Peak resident memory of a 1280 x 720 session, frame included: %.1f MiB\n",
              static_cast<double>(usage.ru_maxrss) / 1024);
  return 0;
}
