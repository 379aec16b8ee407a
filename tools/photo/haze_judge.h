// How strongly the haze is to be taken out, and what stays the same from frame to frame.
#pragma once

#include <array>
#include <optional>

#include "media/orientation.h"
#include "photo/haze_evidence.h"
#include "photo/haze_map.h"

namespace dehaze {

// Mean of the values so far; from `memory` values on it forgets the old ones.
class SteadyValue {
 public:
  void add(double value, double memory);
  double mean() const { return mean_; }

 private:
  double count_ = 0;
  double mean_ = 0;
};

// What a share of haze becomes.
struct Removal {
  double amount;              // 0 ... 1, of the haze found
  double least_transmission;  // below it nothing is amplified any more

  // Of a share of haze in [0, 1].
  double transmission(double share) const;
};

// Judges frame after frame. In a video light and removal change slowly, so that a still scene does
// not flicker, and start anew at a cut.
class HazeJudge {
 public:
  // Without a strength (0 ... 100) it is judged. frames_per_second: 0 if unknown. orientation: of
  // the frames as they are stored.
  HazeJudge(std::optional<int> strength, double frames_per_second, const Orientation& orientation);

  // To be called first for each frame: looks at its light. True for the first frame after a cut,
  // and the first of all.
  bool look_at(BgrImage& small);

  // Of the frames so far; whole numbers, which change only when the mean has left them.
  const Light& light() const { return light_; }
  std::array<double, 3> exact_light() const;  // blue, green, red

  // small: the picture that was looked at. model: its own, or a mean over frames.
  Removal judge(BgrImage& small, const GuidedModel& model);

 private:
  bool is_cut(const BgrImage& small) const;

  std::optional<int> strength_;
  double memory_;
  Orientation orientation_;
  std::array<SteadyValue, 3> light_means_;
  // As in HazeEvidence.
  SteadyValue nearby_haze_;
  SteadyValue amount_;
  SteadyValue largest_amount_;
  Light light_ = {255, 255, 255};
  std::optional<BgrImage> last_;
};

}  // namespace dehaze
