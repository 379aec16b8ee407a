// Keeps the noise of a video out of the haze map.
#pragma once

#include <optional>
#include <vector>

#include "photo/haze_map.h"

namespace dehaze {

// A running mean of guided models over the frames of a video: long where the picture stands still,
// short where it moves. Edges that move are not smeared, since the model is smooth and each frame's
// own pixels are put into it.
class SteadyModel {
 public:
  // The next frame has nothing to do with those before.
  void restart() { mean_.reset(); }

  // model: of the frame whose small picture is given. Returns the mean.
  const GuidedModel& follow(GuidedModel model, const BgrImage& small);

 private:
  std::optional<GuidedModel> mean_;
  std::vector<float> view_;  // mean of the small pictures, likewise
};

}  // namespace dehaze
