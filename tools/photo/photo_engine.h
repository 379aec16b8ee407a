// Haze removal at full resolution, from the library's building blocks.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "engine.h"
#include "photo/haze_judge.h"
#include "photo/steady_model.h"

namespace dehaze {

class PhotoEngine : public Engine {
 public:
  // Without a strength it is judged from the frames.
  PhotoEngine(std::optional<int> strength, const Source& source);

  void process(Nv21Frame& frame) override;
  HazeFindings findings() const override;
  std::vector<float> transmission() const override;

 private:
  HazeJudge judge_;
  SteadyModel steady_model_;
  Removal removal_ = {0, 1};
  std::vector<uint8_t> codes_;  // of the last frame
};

}  // namespace dehaze
