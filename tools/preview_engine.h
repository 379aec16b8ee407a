// The library's frame path: one session, opened for one frame size, closed at the end of the scope.
#ifndef TOOLS_PREVIEW_ENGINE_H
#define TOOLS_PREVIEW_ENGINE_H

#include "console.h"
#include "engine.h"

namespace dehaze {

class PreviewEngine : public Engine {
 public:
  PreviewEngine(int width, int height, const EngineOptions& options, Console& console);
  ~PreviewEngine() override;

  void process(Nv21Frame& frame) override;
  HazeFindings findings() const override;
  std::vector<float> transmission() const override;

 private:
  int width_;
  int height_;
  int level_;
};

}  // namespace dehaze

#endif  // TOOLS_PREVIEW_ENGINE_H
