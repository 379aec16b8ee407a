#include "preview_engine.h"

#include <algorithm>
#include <chrono>
#include <cmath>

#include "errors.h"
#include "haze_preview.h"
#include "photo/haze_map.h"

namespace dehaze {
namespace {

// Levels of the strengths 0 ... 100. From level 20 on hardly anything changes: the transmission
// follows each pixel's own minimum.
constexpr double kLevelPerStrength = 0.2;

// What a hazy picture gets when nothing is said, and nearly clear ones a part of. On the rendered
// pairs of scripts/quality the mean PSNR is best from 12 to 13; from 15 on the ground turns black.
constexpr double kHazyLevel = 12;

constexpr double kUsualRate = 25;

// Samples per row of gPreT, whatever the frame's width.
constexpr size_t kMapRow = 640;

int level_of(const EngineOptions& options) {
  if (options.level) return *options.level;
  return static_cast<int>(std::lround(options.strength.value_or(0) * kLevelPerStrength));
}

}  // namespace

PreviewEngine::PreviewEngine(int width, int height, const EngineOptions& options,
                             const Source& source, Console& console)
    : width_(width), height_(height), level_(level_of(options)) {
  if (options.strength == 0) {
    console.note(
        "strength 0 leaves the haze, but the preview engine's tone curve still lifts dark and "
        "middle tones; --engine photo leaves the picture as it is");
  }
  if (!options.level && !options.strength) {
    const double rate = source.frames_per_second > 0 ? source.frames_per_second : kUsualRate;
    judge_.emplace(std::nullopt, rate, source.orientation);
    frames_to_judge_ = std::max(1, static_cast<int>(std::lround(rate)));
  }
  InitHazePreviewFormat(kInputFormatNv21, width, height);
  if (gHazePreviewMemory == nullptr) throw Error("not enough memory for the frame");
}

PreviewEngine::~PreviewEngine() { ReleaseHazePreview(); }

void PreviewEngine::set_level(HazeJudge& judge, Nv21Frame& frame) {
  BgrImage small = reduced(half_resolution(frame));
  judge.look_at(small);
  const GuidedModel model = fit_guided_model(small, judge.light());
  const Removal removal = judge.judge(small, model);
  level_ = static_cast<int>(std::lround(kHazyLevel * removal.amount));
  if (--frames_to_judge_ == 0) judge_.reset();
}

void PreviewEngine::process(Nv21Frame& frame) {
  if (frame.width != width_ || frame.height != height_) {
    throw Error("internal error: a frame does not have the size of its session");
  }
  if (judge_) set_level(*judge_, frame);
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
