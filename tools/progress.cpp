#include "progress.h"

#include <cinttypes>
#include <cstdio>

namespace dehaze {
namespace {

constexpr std::chrono::milliseconds kRefreshInterval(200);

}  // namespace

Progress::Progress(Console& console, int64_t total_frames)
    : console_(console), total_frames_(total_frames), start_(Clock::now()), last_shown_(start_) {}

void Progress::advance() {
  ++frames_;
  if (!console_.shows_progress()) return;
  const Clock::time_point now = Clock::now();
  if (frames_ > 1 && now - last_shown_ < kRefreshInterval) return;
  last_shown_ = now;
  const double seconds = std::chrono::duration<double>(now - start_).count();
  console_.show_progress(progress_text(frames_, total_frames_, seconds));
}

std::string progress_text(int64_t frames, int64_t total_frames, double seconds) {
  const double speed = seconds > 0 ? static_cast<double>(frames) / seconds : 0;
  char text[128];
  if (total_frames <= 0) {
    std::snprintf(text, sizeof(text), "%" PRId64 " frames, %.1f frames/s", frames, speed);
    return text;
  }
  // Frame counts of containers are often estimates; never show more than 100 %.
  const int64_t total = frames > total_frames ? frames : total_frames;
  const int64_t left =
      speed > 0 ? static_cast<int64_t>(static_cast<double>(total - frames) / speed + 0.5) : 0;
  std::snprintf(text, sizeof(text),
                "%" PRId64 "/%" PRId64 " frames, %" PRId64 " %%, %.1f frames/s, %" PRId64
                ":%02" PRId64 " left",
                frames, total, frames * 100 / total, speed, left / 60, left % 60);
  return text;
}

}  // namespace dehaze
