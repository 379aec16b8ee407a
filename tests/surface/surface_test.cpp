// Every building block with drawn arguments, its buffers between pages that may not be touched.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "tests/support/effort.h"
#include "tests/surface/blocks.h"

namespace haze::test {
namespace {

constexpr int kCallsPerBlock = effort(60, 4);

class Surface : public ::testing::TestWithParam<Placement> {};

INSTANTIATE_TEST_SUITE_P(GuardPages, Surface,
                         ::testing::Values(Placement::kPageStart, Placement::kPageEnd),
                         [](const auto& placement) {
                           return placement.param == Placement::kPageStart ? "Before" : "Behind";
                         });

TEST_P(Surface, EveryBlockKeepsItsPromises) {
  Random random(test_seed());
  for (const Block& block : all_blocks())
    for (int i = 0; i < kCallsPerBlock; ++i) {
      const std::vector<uint8_t> bytes =
          draw_choices(random, static_cast<size_t>(random.between(4, 300)));
      Choices choices(bytes.data(), bytes.size());
      Call call(GetParam());
      block.draw(choices, call);
      call.prepare();
      call.run();
      ASSERT_EQ(call.difference(), "") << block.name << ", call " << i;
    }
}

}  // namespace
}  // namespace haze::test
