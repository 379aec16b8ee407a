#include "photo/photo_engine.h"

#include <algorithm>
#include <chrono>

#include "photo/haze_map.h"
#include "photo/table_recovery.h"

namespace dehaze {

PhotoEngine::PhotoEngine(std::optional<int> strength, double frames_per_second)
    : judge_(strength, frames_per_second) {}

void PhotoEngine::process(Nv21Frame& frame) {
  using Clock = std::chrono::steady_clock;
  const Clock::time_point start = Clock::now();
  {
    BgrImage half = half_resolution(frame);
    BgrImage small = reduced(half);
    judge_.look_at(small);
    const HazeMap map = estimate_haze(small, half, judge_.light());
    removal_ = judge_.judge(map.small);
    codes_ = recovery_codes(map.half, removal_);
  }
  recover(frame, codes_, judge_.exact_light());
  times_.estimate_ms.push_back(
      std::chrono::duration<double, std::milli>(Clock::now() - start).count());
}

HazeFindings PhotoEngine::findings() const {
  const std::array<double, 3> light = judge_.exact_light();
  return {light[2], light[1], light[0], 100 * removal_.amount};
}

std::vector<float> PhotoEngine::transmission() const {
  std::vector<float> map(codes_.size());
  std::transform(codes_.begin(), codes_.end(), map.begin(), transmission_of_code);
  return map;
}

}  // namespace dehaze
