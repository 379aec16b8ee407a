// The library's frame path: one session, opened for one frame size, closed at the end of the scope.
#pragma once

#include <optional>

#include "console.h"
#include "engine.h"
#include "photo/haze_judge.h"

namespace dehaze {

class PreviewEngine : public Engine {
 public:
  PreviewEngine(int width, int height, const EngineOptions& options, const Source& source,
                Console& console);
  ~PreviewEngine() override;

  void process(Nv21Frame& frame) override;
  HazeFindings findings() const override;
  std::vector<float> transmission() const override;

 private:
  void set_level(HazeJudge& judge, Nv21Frame& frame);

  int width_;
  int height_;
  int level_;
  std::optional<HazeJudge> judge_;  // sets the level while there is one
  int frames_to_judge_ = 0;
};

}  // namespace dehaze
