#include "photo_engine.h"

#include <algorithm>
#include <chrono>

#include "haze_preview.h"

namespace dehaze {
namespace {

// Of the minimum filter that makes the dark channel, 15 x 15 pixels like the float transmission's.
constexpr int kDarkRadius = 7;
constexpr int kGuidedRadius = 20;
constexpr int kDefaultStrength = 50;

}  // namespace

PhotoEngine::PhotoEngine(int width, int height, std::optional<int> strength, double)
    : width_(width),
      height_(height),
      strength_(strength),
      codes_(static_cast<size_t>(width / 2) * static_cast<size_t>(height / 2)) {}

void PhotoEngine::process(Nv21Frame& frame) {
  using Clock = std::chrono::steady_clock;
  const Clock::time_point start = Clock::now();
  const int w = width_ / 2;
  const int h = height_ / 2;
  const size_t pixels = codes_.size();
  uint8_t* luma = frame.bytes.data();
  std::vector<uint8_t> bgr(3 * pixels);
  std::vector<uint8_t> darkest(pixels);
  std::vector<uint8_t> dark(pixels);
  std::vector<int> histogram(256);
  xYCrCb2BGRPreview_NV21(luma, luma + 4 * pixels, bgr.data(), width_, height_);
  CalculateMinChannelPreview(bgr.data(), darkest.data(), w, h, 0);
  CalculateDarkChannelPreview(darkest.data(), dark.data(), histogram.data(), w, h, kDarkRadius);
  EstimateAPreview(dark.data(), bgr.data(), histogram.data(), light_bgr_, w, h);

  std::vector<float> t(pixels);
  std::vector<float> t_per_pixel(pixels);
  const int level = strength_.value_or(kDefaultStrength) / 11;
  EstimateTPreview(bgr.data(), light_bgr_, t.data(), t_per_pixel.data(), w, h, level);
  const int radius = std::min({kGuidedRadius, (w - 1) / 2, (h - 1) / 2});
  GuidedFilterPreview(t.data(), t_per_pixel.data(), codes_.data(), w, h, radius);
  HazeRemoving3Preview_NV21(luma, codes_.data(), light_bgr_, width_, height_, 0);
  times_.estimate_ms.push_back(
      std::chrono::duration<double, std::milli>(Clock::now() - start).count());
}

HazeFindings PhotoEngine::findings() const {
  HazeFindings findings;
  findings.light_blue = light_bgr_[0];
  findings.light_green = light_bgr_[1];
  findings.light_red = light_bgr_[2];
  findings.strength = strength_.value_or(kDefaultStrength);
  return findings;
}

std::vector<float> PhotoEngine::transmission() const {
  std::vector<float> map(codes_.size());
  std::transform(codes_.begin(), codes_.end(), map.begin(),
                 [](uint8_t code) { return (static_cast<float>(code) + 40) / 200; });
  return map;
}

}  // namespace dehaze
