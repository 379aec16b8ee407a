// Threads that cannot be started: the caller computes their stripes, whichever they are.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/faults/fault_points.h"
#include "tests/support/effort.h"

namespace haze::test {
namespace {

constexpr int kWidth = 37;
constexpr int kHeight = 50;

// Bit k of `failures` makes the k-th start fail.
std::vector<uint8_t> transmission_with_failures(unsigned failures) {
  std::vector<uint8_t> mean(kWidth * kHeight);
  std::vector<uint8_t> minimum(mean.size());
  for (size_t i = 0; i < mean.size(); ++i) {
    mean[i] = static_cast<uint8_t>(i * 7);
    minimum[i] = static_cast<uint8_t>(i * 13 + 5);
  }
  std::vector<uint8_t> codes(mean.size(), 0xEE);
  Failing failing;
  failing.mask = failures;
  arm_faults({}, failing);
  CalculateTChannelPreview(mean.data(), minimum.data(), codes.data(), kWidth, kHeight, 256, 255, 3);
  const FaultCounts counts = disarm_faults();
  EXPECT_EQ(counts.threads, 8);
  EXPECT_EQ(counts.unjoined, 0);
  return codes;
}

TEST(ThreadStart, TransmissionIsTheSameWhicheverThreadsFail) {
  const std::vector<uint8_t> expected = transmission_with_failures(0);
  for (unsigned failures = 1; failures < 256; failures += effort(1, 7))
    EXPECT_EQ(transmission_with_failures(failures), expected) << "failing calls " << failures;
}

}  // namespace
}  // namespace haze::test
