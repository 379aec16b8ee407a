#include "progress.h"

#include <algorithm>
#include <cinttypes>
#include <cmath>
#include <cstdio>
#include <utility>

namespace dehaze {
namespace {

constexpr std::chrono::milliseconds kRefreshInterval(200);

}  // namespace

Progress::Progress(Console& console, std::string unit, int64_t total)
    : console_(console),
      unit_(std::move(unit)),
      total_(total),
      start_(Clock::now()),
      last_shown_(start_) {}

void Progress::advance() {
  ++done_;
  if (!console_.shows_progress()) return;
  const Clock::time_point now = Clock::now();
  if (done_ > 1 && now - last_shown_ < kRefreshInterval) return;
  last_shown_ = now;
  const double seconds = std::chrono::duration<double>(now - start_).count();
  // Frame counts of containers are often estimates; never show more than 100 %.
  const int64_t total = total_ > 0 ? std::max(done_, total_) : 0;
  const double share = total > 0 ? static_cast<double>(done_) / static_cast<double>(total) : -1;
  console_.show_progress({share, progress_text(unit_, done_, total, seconds)});
}

void StepProgress::begin(const std::string& what) {
  const double share = static_cast<double>(begun_) / steps_;
  ++begun_;
  if (!console_.shows_progress()) return;
  console_.show_progress(
      {share, "step " + std::to_string(begun_) + "/" + std::to_string(steps_) + ": " + what});
}

std::string progress_text(const std::string& unit, int64_t done, int64_t total, double seconds) {
  const double speed = seconds > 0 ? static_cast<double>(done) / seconds : 0;
  char text[160];
  if (total <= 0) {
    std::snprintf(text, sizeof(text), "%" PRId64 " %s, %.1f %s/s", done, unit.c_str(), speed,
                  unit.c_str());
    return text;
  }
  const int64_t left = speed > 0 ? std::llround(static_cast<double>(total - done) / speed) : 0;
  std::snprintf(text, sizeof(text),
                "%" PRId64 "/%" PRId64 " %s, %" PRId64 " %%, %.1f %s/s, %s left", done, total,
                unit.c_str(), done * 100 / total, speed, unit.c_str(), duration_text(left).c_str());
  return text;
}

std::string duration_text(int64_t seconds) {
  char text[64];
  if (seconds < 3600) {
    std::snprintf(text, sizeof(text), "%" PRId64 ":%02" PRId64, seconds / 60, seconds % 60);
  } else {
    std::snprintf(text, sizeof(text), "%" PRId64 ":%02" PRId64 ":%02" PRId64, seconds / 3600,
                  seconds / 60 % 60, seconds % 60);
  }
  return text;
}

}  // namespace dehaze
