// Progress of a file: frames or steps, share done, speed and time left.
#pragma once

#include <chrono>
#include <cstdint>
#include <string>

#include "console.h"

namespace dehaze {

class Progress {
 public:
  // unit: "frames". total: 0 if unknown, as for a pipe.
  Progress(Console& console, std::string unit, int64_t total);

  // To be called once per finished unit; refreshes the line a few times a second.
  void advance();

 private:
  using Clock = std::chrono::steady_clock;

  Console& console_;
  std::string unit_;
  int64_t total_;
  int64_t done_ = 0;
  Clock::time_point start_;
  Clock::time_point last_shown_;
};

// Progress of a picture: which step of how many.
class StepProgress {
 public:
  StepProgress(Console& console, int steps) : console_(console), steps_(steps) {}

  // "step 2/4: taking the haze out"
  void begin(const std::string& what);

 private:
  Console& console_;
  int steps_;
  int begun_ = 0;
};

// "120/300 frames, 40 %, 58.3 frames/s, 0:03 left"; without a total "120 frames, 58.3 frames/s".
std::string progress_text(const std::string& unit, int64_t done, int64_t total, double seconds);

// "0:03", "1:02:03"
std::string duration_text(int64_t seconds);

}  // namespace dehaze
