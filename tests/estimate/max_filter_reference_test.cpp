// The maximum of a window and the one that is carried from sample to sample are the same, down to
// the sign of zeros.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "tests/reference/float_transmission.h"
#include "tests/support/float_planes.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Plane = std::vector<float>;

TEST(MaxFilterReference, CarriedMaximumIsThatOfTheWindow) {
  Random random(test_seed());
  for (int radius = 0; radius <= 8; ++radius)
    for (int count = 2 * radius + 1; count <= 40; ++count) {
      Plane line = make_plane(random, FloatMood::kIntegers, count, 1);
      for (float& sample : line)
        if (sample < 100.0f) sample = random.between(0, 1) == 0 ? 0.0f : -0.0f;
      EXPECT_TRUE(planes_match(reference::carried_maximum(line.data(), count, radius),
                               reference::window_maximum(line.data(), count, radius)));
    }
}

}  // namespace
}  // namespace haze::test
