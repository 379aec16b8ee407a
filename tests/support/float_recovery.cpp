#include "tests/support/float_recovery.h"

#include <gtest/gtest.h>

#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/reference/recovery_variants.h"
#include "tests/support/bytes_match.h"
#include "tests/support/float_planes.h"
#include "tests/support/guarded_buffer.h"

namespace haze::test {

const FloatRecovery kAnchors = {"Anchors", HazeRemovingPreview, reference::recover_anchors};
const FloatRecovery kInteger = {"Integer", HazeRemoving1Preview, reference::recover_each_integer};
const FloatRecovery kSingle = {"Single", HazeRemoving2Preview, reference::recover_each_single};
const FloatRecovery kNv21 = {"Nv21", HazeRemoving3Preview_NV21_f, reference::recover_nv21_float};

void compare(const FloatRecovery& member, const std::vector<uint8_t>& frame,
             const std::vector<float>& map, const Light& light, int width, int height,
             int ignored) {
  std::vector<uint8_t> want = frame;
  member.reference(want.data(), map.data(), light.data(), width, height);
  GuardedBuffer<uint8_t> actual(frame);
  GuardedBuffer<float> transmission(map);
  GuardedBuffer<uint8_t> light_bgr(std::vector<uint8_t>(light.begin(), light.end()));
  member.recover(actual.data(), transmission.data(), light_bgr.data(), width, height, ignored);
  ASSERT_TRUE(bytes_match(actual, want,
                          {{"width", width},
                           {"height", height},
                           {"first t", map[0]},
                           {"B", light[0]},
                           {"G", light[1]},
                           {"R", light[2]},
                           {"row", width}}))
      << member.name;
  ASSERT_TRUE(planes_match(transmission, map));
  ASSERT_TRUE(bytes_match(light_bgr, light));
}

std::vector<uint8_t> run(const FloatRecovery& member, std::vector<uint8_t> frame,
                         std::vector<float> map, Light light, int width, int height) {
  member.recover(frame.data(), map.data(), light.data(), width, height, 0);
  return frame;
}

std::vector<uint8_t> AllValues::frame() {
  std::vector<uint8_t> frame;
  for (size_t i = 0; i < kLumaBytes; ++i) frame.push_back(static_cast<uint8_t>(i * 77 / 4));
  for (size_t i = 0; i < kChromaBytes; ++i) frame.push_back(static_cast<uint8_t>(i));
  for (size_t i = 0; i < kChromaBytes; ++i) frame.push_back(static_cast<uint8_t>(255 - i));
  return frame;
}

std::vector<float> AllValues::map(float t) { return std::vector<float>(kChromaBytes, t); }

}  // namespace haze::test
