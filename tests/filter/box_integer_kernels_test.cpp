// The divisions of the integer box filters on NEON, each called by name.
#include "filter/box_integer_kernels.h"

#include <gtest/gtest.h>

#include <cstdint>

namespace haze::test {
namespace {

#if HAZE_NEON
TEST(BoxIntegerKernels, NeonMeansOf64ColumnsAreExactForEverySum) {
  for (int rows = 32; rows <= 64; ++rows) {
    const int16x8_t reciprocal = filter::reciprocal_of_rows(rows);
    const int count = 64 * rows;
    // Sums just below, at and beyond each multiple of 64, which is what the division sees.
    for (int sum = 0; sum <= 255 * count; sum += 64) {
      const int below = sum + 63 <= 255 * count ? sum + 63 : sum;
      const uint8x8_t means =
          filter::means_64_neon(vdupq_n_s32(sum), vdupq_n_s32(below), reciprocal);
      ASSERT_EQ(vget_lane_u8(means, 0), sum / count) << sum << " / " << count;
      ASSERT_EQ(vget_lane_u8(means, 4), below / count) << below << " / " << count;
    }
  }
}

// The quotient never falls as the sum grows, so it is exact everywhere if it is exact at every
// multiple of the count and just below it.
TEST(BoxIntegerKernels, NeonDivisionIsExactForEveryCount) {
  for (int count = 2; count <= 255 * 255; ++count) {
    const filter::CountNeon divisor(count);
    // Every mean for small counts, some of them for large ones.
    for (int mean = 1; mean <= 255; mean += count < 4096 ? 1 : 127) {
      const int32_t sums[4] = {mean * count, mean * count - 1, 0, 255 * count};
      const uint32x4_t means = vshrq_n_u32(divisor.divide(vld1q_s32(sums)), 16);
      ASSERT_EQ(vgetq_lane_u32(means, 0), static_cast<uint32_t>(mean)) << sums[0] << " / " << count;
      ASSERT_EQ(vgetq_lane_u32(means, 1), static_cast<uint32_t>(mean - 1))
          << sums[1] << " / " << count;
      ASSERT_EQ(vgetq_lane_u32(means, 2), 0u);
      ASSERT_EQ(vgetq_lane_u32(means, 3), 255u) << sums[3] << " / " << count;
    }
  }
}
#endif

}  // namespace
}  // namespace haze::test
