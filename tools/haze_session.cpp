#include "haze_session.h"

#include <algorithm>
#include <chrono>
#include <cstdio>

#include "errors.h"
#include "haze_preview.h"

namespace dehaze {
namespace {

double median(std::vector<double> values) {
  const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
  std::nth_element(values.begin(), middle, values.end());
  if (values.size() % 2 == 1) return *middle;
  return (*middle + *std::max_element(values.begin(), middle)) / 2;
}

std::string describe(const char* kind, const std::vector<double>& ms) {
  char text[128];
  std::snprintf(text, sizeof(text), "%s %.3f ms median, %.3f ms minimum, %zu frame%s", kind,
                median(ms), *std::min_element(ms.begin(), ms.end()), ms.size(),
                ms.size() == 1 ? "" : "s");
  return text;
}

}  // namespace

std::string describe(const FrameTimes& times) {
  std::string text;
  if (!times.estimate_ms.empty()) text = describe("estimate", times.estimate_ms);
  if (!times.reuse_ms.empty()) text += "; " + describe("reuse", times.reuse_ms);
  return text.empty() ? "no frames" : text;
}

HazeSession::HazeSession(int width, int height, int level)
    : width_(width), height_(height), level_(level) {
  InitHazePreviewFormat(kInputFormatNv21, width, height);
  if (gHazePreviewMemory == nullptr) throw Error("not enough memory for the frame");
}

HazeSession::~HazeSession() { ReleaseHazePreview(); }

void HazeSession::process(Nv21Frame& frame) {
  if (frame.width != width_ || frame.height != height_) {
    throw Error("internal error: a frame does not have the size of its session");
  }
  using Clock = std::chrono::steady_clock;
  const bool is_estimate = gPreFrameNum == 0;
  const Clock::time_point start = Clock::now();
  RemoveHazePreview(frame.bytes.data(), width_, height_, 0, level_);
  const double ms = std::chrono::duration<double, std::milli>(Clock::now() - start).count();
  (is_estimate ? times_.estimate_ms : times_.reuse_ms).push_back(ms);
}

}  // namespace dehaze
