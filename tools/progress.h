// Progress of a video: frames, share done, speed and time left.
#ifndef TOOLS_PROGRESS_H
#define TOOLS_PROGRESS_H

#include <chrono>
#include <cstdint>
#include <string>

#include "console.h"

namespace dehaze {

class Progress {
 public:
  // total_frames: 0 if unknown, as for a pipe.
  Progress(Console& console, int64_t total_frames);

  // To be called once per finished frame; refreshes the line a few times a second.
  void advance();

 private:
  using Clock = std::chrono::steady_clock;

  Console& console_;
  int64_t total_frames_;
  int64_t frames_ = 0;
  Clock::time_point start_;
  Clock::time_point last_shown_;
};

// "120/300 frames, 40 %, 58.3 frames/s, 0:03 left"; without a total "120 frames, 58.3 frames/s".
std::string progress_text(int64_t frames, int64_t total_frames, double seconds);

}  // namespace dehaze

#endif  // TOOLS_PROGRESS_H
