#include "photo/photo_engine.h"

#include <algorithm>
#include <chrono>

#include "photo/haze_map.h"
#include "photo/table_recovery.h"

namespace dehaze {

PhotoEngine::PhotoEngine(std::optional<int> strength, const Source& source)
    : judge_(strength, source.frames_per_second, source.orientation) {}

void PhotoEngine::process(Nv21Frame& frame) {
  using Clock = std::chrono::steady_clock;
  const Clock::time_point start = Clock::now();
  {
    BgrImage half = half_resolution(frame);
    BgrImage small = reduced(half);
    if (judge_.look_at(small)) steady_model_.restart();
    const GuidedModel& model = steady_model_.follow(fit_guided_model(small, judge_.light()), small);
    removal_ = judge_.judge(small, model);
    codes_ = recovery_codes(share_of_haze(half, model, judge_.light()), removal_);
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
