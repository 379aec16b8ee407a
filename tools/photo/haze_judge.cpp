#include "photo/haze_judge.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace dehaze {
namespace {

// The dark channel of a clear view is not quite 0: this share counts as the things' own.
constexpr double kOwnShare = 0.05;

// Haze of a picture, as hazy() says: below the first value it is clear, from the second on all of
// the haze is taken out. Clear renderings and photographs lie below 0.03 unless they are full of
// bright grey things; light haze begins at 0.1.
constexpr double kClear = 0.01;
constexpr double kHazy = 0.08;
constexpr double kLeastAmount = 0.1;

// The thicker the haze, the more has to be amplified to see through it; where there is little, what
// looks like thick haze is bright sky.
constexpr double kHazeTimesLeastTransmission = 0.05;
constexpr double kLeastTransmission = 0.06;
constexpr double kLargestLeastTransmission = 0.35;

constexpr double kSecondsOfMemory = 2;
constexpr double kUsualRate = 25;

// The first frame is what everybody has seen: the next ones should not pull away from it.
constexpr double kFirstValueCounts = 8;

// Mean change of a sample from one frame to the next.
constexpr double kCut = 30;

// How far the mean of the light may lie from the whole number in use.
constexpr double kLightSlack = 0.75;

double quantile(std::vector<float> values, double part) {
  const size_t position = static_cast<size_t>(part * static_cast<double>(values.size() - 1));
  const auto nth = values.begin() + static_cast<ptrdiff_t>(position);
  std::nth_element(values.begin(), nth, values.end());
  return *nth;
}

// Haze over the nearest things, which a clear view shows without any, and half of that over the
// first quarter. The far half, with the sky, says little: it looks alike in all weathers.
double hazy(const Plane& share) {
  return quantile(share.values, 0.05) + quantile(share.values, 0.25) / 2;
}

}  // namespace

void SteadyValue::add(double value, double memory) {
  count_ = count_ == 0 ? 1 : std::min(std::max(count_, kFirstValueCounts) + 1, memory);
  mean_ += (value - mean_) / count_;
}

double Removal::transmission(double share) const {
  const double haze = std::clamp((share - kOwnShare) / (1 - kOwnShare), 0.0, 1.0);
  return std::max(1 - amount * haze, least_transmission);
}

HazeJudge::HazeJudge(std::optional<int> strength, double frames_per_second,
                     const Orientation& orientation)
    : strength_(strength),
      memory_(kFirstValueCounts +
              kSecondsOfMemory * (frames_per_second > 0 ? frames_per_second : kUsualRate)),
      orientation_(orientation) {}

bool HazeJudge::is_cut(const BgrImage& small) const {
  if (!last_ || last_->bytes.size() != small.bytes.size()) return true;
  double sum = 0;
  for (size_t i = 0; i < small.bytes.size(); ++i) {
    sum += std::abs(small.bytes[i] - last_->bytes[i]);
  }
  return sum > kCut * static_cast<double>(small.bytes.size());
}

bool HazeJudge::look_at(BgrImage& small) {
  const bool starts = is_cut(small);
  if (starts) {
    light_means_ = {};
    haze_ = {};
  }
  last_ = small;
  const Light found = estimate_light(small, orientation_);
  for (size_t c = 0; c < found.size(); ++c) {
    light_means_[c].add(found[c], memory_);
    const double mean = light_means_[c].mean();
    if (starts || std::abs(mean - light_[c]) > kLightSlack) {
      light_[c] = static_cast<uint8_t>(std::lround(mean));
    }
  }
  return starts;
}

std::array<double, 3> HazeJudge::exact_light() const {
  return {light_means_[0].mean(), light_means_[1].mean(), light_means_[2].mean()};
}

Removal HazeJudge::judge(const Plane& share) {
  haze_.add(hazy(share), memory_);
  const double haze = haze_.mean();
  Removal removal;
  removal.least_transmission = std::clamp(kHazeTimesLeastTransmission / std::max(haze, 1e-6),
                                          kLeastTransmission, kLargestLeastTransmission);
  removal.amount = strength_ ? *strength_ / 100.0
                             : std::clamp((haze - kClear) / (kHazy - kClear), kLeastAmount, 1.0);
  return removal;
}

}  // namespace dehaze
