#include "photo/steady_model.h"

#include <algorithm>
#include <cmath>

namespace dehaze {
namespace {

// Weight of a new frame where the picture stands still.
constexpr float kLeastWeight = 0.05F;

// Mean change of a pixel's three samples that noise explains, and one that only movement does.
constexpr float kNoise = 9;
constexpr float kMovement = 24;

float weight_of_change(float change) {
  return std::clamp((change - kNoise) / (kMovement - kNoise), kLeastWeight, 1.0F);
}

}  // namespace

const GuidedModel& SteadyModel::follow(GuidedModel model, const BgrImage& small) {
  if (!mean_ || view_.size() != small.bytes.size()) {
    mean_.emplace(std::move(model));
    view_.assign(small.bytes.begin(), small.bytes.end());
    return *mean_;
  }
  const auto move = [](float& mean, float value, float weight) { mean += weight * (value - mean); };
  for (size_t i = 0; i < model.slope.values.size(); ++i) {
    const uint8_t* now = &small.bytes[3 * i];
    float* before = &view_[3 * i];
    float change = 0;
    for (int c = 0; c < 3; ++c) change += std::abs(now[c] - before[c]) / 3;
    const float weight = weight_of_change(change);
    for (int c = 0; c < 3; ++c) move(before[c], now[c], weight);
    move(mean_->slope.values[i], model.slope.values[i], weight);
    move(mean_->offset.values[i], model.offset.values[i], weight);
  }
  return *mean_;
}

}  // namespace dehaze
