// One session of the library: opened for one frame size, closed at the end of the scope.
#ifndef TOOLS_HAZE_SESSION_H
#define TOOLS_HAZE_SESSION_H

#include <string>
#include <vector>

#include "media/nv21.h"

namespace dehaze {

// Milliseconds that RemoveHazePreview took, one entry per call. The library estimates the haze on
// every second frame and reuses that estimate on the frame between, at very different cost.
struct FrameTimes {
  std::vector<double> estimate_ms;
  std::vector<double> reuse_ms;
};

// "estimate 0.61 ms median, 0.58 ms minimum, 150 frames; reuse ..." for the kinds that occurred.
std::string describe(const FrameTimes& times);

class HazeSession {
 public:
  HazeSession(int width, int height, int level);
  ~HazeSession();
  HazeSession(const HazeSession&) = delete;
  HazeSession& operator=(const HazeSession&) = delete;

  // Dehazes in place a frame of the session's size.
  void process(Nv21Frame& frame);

  const FrameTimes& times() const { return times_; }

 private:
  int width_;
  int height_;
  int level_;
  FrameTimes times_;
};

}  // namespace dehaze

#endif  // TOOLS_HAZE_SESSION_H
