#include "preview_engine.h"

#include <chrono>
#include <cmath>

#include "errors.h"
#include "haze_preview.h"

namespace dehaze {
namespace {

// Amount of haze removal when nothing is said. Measured on the rendered pair in samples/, whose
// clear version is known: from 8 to 11 both PSNR and SSIM against it are near their best, below the
// haze stays, above the ground turns black. README.md has the table.
constexpr int kDefaultLevel = 10;

// So that the default lies in the middle of the scale, at 50.
constexpr double kLevelPerStrength = 0.2;

// Samples per row of gPreT, whatever the frame's width.
constexpr size_t kMapRow = 640;

int level_of(const EngineOptions& options) {
  if (options.level) return *options.level;
  if (!options.strength) return kDefaultLevel;
  return static_cast<int>(std::lround(*options.strength * kLevelPerStrength));
}

}  // namespace

PreviewEngine::PreviewEngine(int width, int height, const EngineOptions& options, Console& console)
    : width_(width), height_(height), level_(level_of(options)) {
  if (options.strength == 0) {
    console.note(
        "strength 0 leaves the haze, but the preview engine's tone curve still lifts dark and "
        "middle tones; --engine photo leaves the picture as it is");
  }
  InitHazePreviewFormat(kInputFormatNv21, width, height);
  if (gHazePreviewMemory == nullptr) throw Error("not enough memory for the frame");
}

PreviewEngine::~PreviewEngine() { ReleaseHazePreview(); }

void PreviewEngine::process(Nv21Frame& frame) {
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

HazeFindings PreviewEngine::findings() const {
  HazeFindings findings;
  findings.light_blue = gPreAA[0];
  findings.light_green = gPreAA[1];
  findings.light_red = gPreAA[2];
  findings.strength = std::min(level_ / kLevelPerStrength, static_cast<double>(kMaxStrength));
  return findings;
}

std::vector<float> PreviewEngine::transmission() const {
  const size_t columns = static_cast<size_t>(width_) / 2;
  const size_t rows = static_cast<size_t>(height_) / 2;
  std::vector<float> map;
  map.reserve(columns * rows);
  for (size_t y = 0; y < rows; ++y) {
    const unsigned char* codes = &gPreT[y * kMapRow];
    for (size_t x = 0; x < columns; ++x) {
      map.push_back((static_cast<float>(codes[x]) + 40) / 200);
    }
  }
  return map;
}

}  // namespace dehaze
