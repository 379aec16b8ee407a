// Haze removal at full resolution, from the library's building blocks.
#ifndef TOOLS_PHOTO_ENGINE_H
#define TOOLS_PHOTO_ENGINE_H

#include <cstdint>
#include <optional>
#include <vector>

#include "engine.h"

namespace dehaze {

class PhotoEngine : public Engine {
 public:
  // Without a strength it is judged from the frames.
  PhotoEngine(int width, int height, std::optional<int> strength, double frames_per_second);

  void process(Nv21Frame& frame) override;
  HazeFindings findings() const override;
  std::vector<float> transmission() const override;

 private:
  int width_;
  int height_;
  std::optional<int> strength_;
  uint8_t light_bgr_[3] = {255, 255, 255};
  std::vector<uint8_t> codes_;
};

}  // namespace dehaze

#endif  // TOOLS_PHOTO_ENGINE_H
