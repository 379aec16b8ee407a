#include "photo/haze_judge.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace dehaze {
namespace {

// Hardly to be seen in a clear picture, and good for one with the thinnest haze.
constexpr double kLeastAmount = 0.05;

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

}  // namespace

void SteadyValue::add(double value, double memory) {
  count_ = count_ == 0 ? 1 : std::min(std::max(count_, kFirstValueCounts) + 1, memory);
  mean_ += (value - mean_) / count_;
}

double Removal::transmission(double share) const {
  return std::max(1 - amount * haze_of_share(share), least_transmission);
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
    nearby_haze_ = {};
    amount_ = {};
    largest_amount_ = {};
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

Removal HazeJudge::judge(BgrImage& small, const GuidedModel& model) {
  const HazeEvidence found = find_haze(small, model, light_, exact_light(), orientation_);
  nearby_haze_.add(found.nearby, memory_);
  amount_.add(found.amount, memory_);
  largest_amount_.add(found.largest_amount, memory_);
  Removal removal;
  removal.least_transmission =
      std::clamp(kHazeTimesLeastTransmission / std::max(nearby_haze_.mean(), 1e-6),
                 kLeastTransmission, kLargestLeastTransmission);
  removal.amount = strength_
                       ? *strength_ / 100.0
                       : std::max(std::min(amount_.mean(), largest_amount_.mean()), kLeastAmount);
  return removal;
}

}  // namespace dehaze
