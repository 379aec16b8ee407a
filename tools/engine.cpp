#include "engine.h"

#include <algorithm>
#include <cstdio>

#include "photo/photo_engine.h"
#include "preview_engine.h"

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

FrameSize engine_frame_size(EngineKind kind, int width, int height) {
  return kind == EngineKind::kPreview ? fit_frame_size(width, height)
                                      : whole_frame_size(width, height);
}

std::unique_ptr<Engine> make_engine(EngineKind kind, const EngineOptions& options, int width,
                                    int height, const Source& source, Console& console) {
  if (kind == EngineKind::kPreview) {
    return std::make_unique<PreviewEngine>(width, height, options, source, console);
  }
  return std::make_unique<PhotoEngine>(options.strength, source);
}

}  // namespace dehaze
