// The recoveries of frames by maps of float transmissions, each beside its definition.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "tests/support/recovery_inputs.h"

namespace haze::test {

struct FloatRecovery {
  const char* name;
  void (*recover)(unsigned char*, float*, unsigned char*, int, int, int);
  void (*reference)(uint8_t*, const float*, const uint8_t*, int, int);
};

extern const FloatRecovery kAnchors;  // HazeRemovingPreview
extern const FloatRecovery kInteger;  // HazeRemoving1Preview
extern const FloatRecovery kSingle;   // HazeRemoving2Preview
extern const FloatRecovery kNv21;     // HazeRemoving3Preview_NV21_f, the only one of NV21 frames

// Frame, map and light in buffers of their exact sizes, against the reference.
void compare(const FloatRecovery& member, const std::vector<uint8_t>& frame,
             const std::vector<float>& map, const Light& light, int width, int height,
             int ignored = 0);

// The recovered frame.
std::vector<uint8_t> run(const FloatRecovery& member, std::vector<uint8_t> frame,
                         std::vector<float> map, Light light, int width, int height);

// A frame that holds every byte value four times in luma, and in each chroma plane in opposite
// orders, with a map of one value. Its rows are a little longer than whole steps of any vector
// path.
struct AllValues {
  static constexpr int kWidth = 264;
  static constexpr int kHeight = 4;
  static constexpr size_t kLumaBytes = kWidth * kHeight;
  static constexpr size_t kChromaBytes = kLumaBytes / 4;

  static std::vector<uint8_t> frame();
  static std::vector<float> map(float t);
};

}  // namespace haze::test
