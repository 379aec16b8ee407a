// What the library's callers must not do, done: forbidden_use session|slot|unslotted
//
// The thread sanitizer has to report a race in each case. That shows that the rule in the header is
// needed, and that the other tests would see a race where there is one.
#include <cstdio>
#include <cstring>
#include <thread>
#include <vector>

#include "haze_preview.h"

namespace {

constexpr int kSide = 128;
constexpr int kTurns = 50;

template <class Work>
void from_two_threads(const Work& work) {
  std::thread other([&] {
    for (int i = 0; i < kTurns; ++i) work(1);
  });
  for (int i = 0; i < kTurns; ++i) work(0);
  other.join();
}

// Each caller has a frame of its own, but there is one session.
void two_callers_of_the_session() {
  std::vector<unsigned char> frames[2];
  for (auto& frame : frames) frame.assign(kSide * kSide * 3 / 2, 100);
  InitHazePreviewFormat(kInputFormatNv21, kSide, kSide);
  from_two_threads(
      [&](int caller) { RemoveHazePreview(frames[caller].data(), kSide, kSide, 0, 100); });
  ReleaseHazePreview();
}

void two_callers_of_a_slot() {
  std::vector<unsigned char> src(3 * kSide * kSide, 50);
  std::vector<unsigned char> maps[2];
  for (auto& map : maps) map.resize(kSide * kSide);
  from_two_threads([&](int caller) {
    CalculateMinChannelPreview(src.data(), maps[caller].data(), kSide, kSide, 5);
  });
}

void two_callers_of_a_stage_without_slots() {
  std::vector<unsigned char> planes[2];
  for (auto& plane : planes) plane.assign(kSide * kSide, 50);
  from_two_threads([&](int caller) { CalSumThreadPreview(planes[caller].data(), kSide, kSide); });
}

}  // namespace

int main(int argc, char** argv) {
  const char* const use = argc == 2 ? argv[1] : "";
  if (std::strcmp(use, "session") == 0)
    two_callers_of_the_session();
  else if (std::strcmp(use, "slot") == 0)
    two_callers_of_a_slot();
  else if (std::strcmp(use, "unslotted") == 0)
    two_callers_of_a_stage_without_slots();
  else
    return std::fprintf(stderr, "usage: forbidden_use session|slot|unslotted\n"), 2;
  return 0;
}
