#include "photo/haze_evidence.h"

#include <algorithm>
#include <cstddef>
#include <vector>

namespace dehaze {
namespace {

// The dark channel of a clear view is not quite 0: this share counts as the things' own.
constexpr double kOwnShare = 0.05;

// Of the picture, from its top down, and the share of a band's pixels that may be darker than what
// counts as its darkest.
constexpr size_t kBands = 16;
constexpr double kDarkestPart = 0.01;
// A band with a larger share of haze even there shows no ground, but sky or haze alone.
constexpr double kGroundShare = 0.5;
// Among the bands of the ground: a little beyond the middle, because haze is sought far away.
constexpr double kJudgedBand = 0.65;

// The veil over the darkest things on the ground, in parts of white. What a clear view's darkest
// things show of their own reaches the first value; from the second on all of the haze is taken
// out. In between the part taken out grows evenly, since some of what looks like haze is the
// things' own: with all of it taken out a thin veil would leave the picture farther from the truth
// than it was.
constexpr double kClearVeil = 0.03;
constexpr double kFullVeil = 0.10;

// The same veil as part of the mean share of haze over that ground. Haze lies over dark things as
// over bright ones: up to the first value what looks like haze is bright grey things, asphalt, walls
// or sand, and the map says too much; from the second on all of it is believed.
constexpr double kNotConfirmed = 0.25;
constexpr double kConfirmed = 0.55;

// Haze of a picture, as hazy() says: all three measures have to find it.
constexpr double kClear = 0.01;
constexpr double kHazy = 0.08;

// The light of haze by day is brighter than the second value, in parts of white. A picture without
// any sky or distance gives a thing's colour instead, which is mostly darker; below the first value
// none is found.
constexpr double kNoLight = 0.3;
constexpr double kDaylight = 0.45;

// A picture is exposed so that half of it is brighter than this, in parts of white; where the hazy
// one was darker already, it may lose another quarter.
constexpr double kLeastMedian = 0.14;
constexpr double kLeastPartOfMedian = 0.75;

// Darker than what a camera shows of a scene: the bars beside a film.
constexpr int kBar = 3;

double quantile(std::vector<float> values, double part) {
  if (values.empty()) return 0;
  const size_t position = static_cast<size_t>(part * static_cast<double>(values.size() - 1));
  const auto nth = values.begin() + static_cast<ptrdiff_t>(position);
  std::nth_element(values.begin(), nth, values.end());
  return *nth;
}

double luma(double blue, double green, double red) {
  return 0.114 * blue + 0.587 * green + 0.299 * red;
}

double rise(double value, double first, double last) {
  return std::clamp((value - first) / (last - first), 0.0, 1.0);
}

// The pixels of a picture that show something.
struct Scene {
  std::vector<float> share;  // of the haze
  std::vector<float> luma;
  std::array<std::vector<float>, kBands> by_pixel;  // shares by each pixel alone
  std::array<double, kBands> band_sums = {};        // of the share
};

Scene without_bars(BgrImage& small, const GuidedModel& model, const Light& light,
                   const Orientation& orientation) {
  const Plane by_pixel = share_by_pixel(small, light);
  const Plane share = share_of_haze(small, model, light);
  Scene scene;
  const uint8_t* bgr = small.bytes.data();
  size_t i = 0;
  for (int y = 0; y < small.height; ++y) {
    for (int x = 0; x < small.width; ++x, ++i, bgr += 3) {
      if (std::max({bgr[0], bgr[1], bgr[2]}) <= kBar) continue;
      scene.share.push_back(share.values[i]);
      scene.luma.push_back(static_cast<float>(luma(bgr[0], bgr[1], bgr[2])));
      const size_t band = std::min(
          static_cast<size_t>(kBands * depth_in_view(x, y, small, orientation)), kBands - 1);
      scene.by_pixel[band].push_back(by_pixel.values[i]);
      scene.band_sums[band] += share.values[i];
    }
  }
  return scene;
}

// Shares of haze on the ground.
struct Ground {
  double veil;  // over the darkest things
  double mean;  // over all things
};

// The ground comes nearer from band to band, so that none has more haze than one above it: snow or
// sand in front, without anything dark, does not count as a veil. A black thing in front hides the
// veil of its own bands and of those below only.
Ground look_at_ground(const Scene& scene) {
  std::vector<float> veils;
  double veil = 1;
  double means = 0;
  for (size_t i = 0; i < kBands; ++i) {
    const std::vector<float>& band = scene.by_pixel[i];
    if (band.empty()) continue;
    veil = std::min(veil, quantile(band, kDarkestPart));
    if (veil >= kGroundShare) continue;
    veils.push_back(static_cast<float>(veil));
    means += scene.band_sums[i] / static_cast<double>(band.size());
  }
  if (veils.empty()) return {veil, veil};
  return {quantile(veils, kJudgedBand), means / static_cast<double>(veils.size())};
}

// Haze over the nearest things, which a clear view shows without any, and half of that over the
// first quarter. The far half, with the sky, says little: it looks alike in all weathers.
double hazy(const std::vector<float>& share) {
  return quantile(share, 0.05) + quantile(share, 0.25) / 2;
}

// The amount that brings the median of luma to the least one: from the haze model and the mean
// share of the pixels just below the median.
double largest_amount(const Scene& scene, double light) {
  const double median = quantile(scene.luma, 0.5);
  const double least = std::min(255 * kLeastMedian, kLeastPartOfMedian * median);
  const double low = quantile(scene.luma, 0.4);
  double sum = 0;
  int count = 0;
  for (size_t i = 0; i < scene.luma.size(); ++i) {
    if (scene.luma[i] < low || scene.luma[i] > median) continue;
    sum += scene.share[i];
    ++count;
  }
  if (count == 0 || light <= median) return 1;
  const double haze = haze_of_share(sum / count);
  const double transmission = (light - median) / (light - least);
  return (1 - transmission) / std::max(haze, 1e-6);
}

}  // namespace

double haze_of_share(double share) {
  return std::clamp((share - kOwnShare) / (1 - kOwnShare), 0.0, 1.0);
}

HazeEvidence find_haze(BgrImage& small, const GuidedModel& model, const Light& light,
                       const std::array<double, 3>& exact_light, const Orientation& orientation) {
  const Scene scene = without_bars(small, model, light, orientation);
  const double light_luma = luma(exact_light[0], exact_light[1], exact_light[2]);
  const double brightness = light_luma / 255;
  const Ground ground = look_at_ground(scene);
  HazeEvidence evidence;
  evidence.nearby = hazy(scene.share);
  evidence.amount =
      rise(brightness, kNoLight, kDaylight) *
      std::min({rise(brightness * ground.veil, kClearVeil, kFullVeil),
                rise(ground.veil / std::max(ground.mean, 1e-6), kNotConfirmed, kConfirmed),
                rise(evidence.nearby, kClear, kHazy)});
  evidence.largest_amount = std::min(largest_amount(scene, light_luma), 1.0);
  return evidence;
}

}  // namespace dehaze
