// The row kernels of the channel extraction, each called by name.
#include "color/max_min_nv21_kernels.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "tests/reference/max_min_nv21.h"
#include "tests/support/bytes_match.h"

namespace haze::test {
namespace {

// One row holding every (Cr, Cb) pair with one luma value.
struct EveryChroma {
  static constexpr int kWidth = 256 * 256;

  explicit EveryChroma(int y) : luma(2 * kWidth), chroma(2 * kWidth) {
    for (size_t i = 0; i < kWidth; ++i) {
      luma[2 * i] = static_cast<uint8_t>(y);
      luma[2 * i + 1] = static_cast<uint8_t>(~y);  // odd columns have no effect
      chroma[2 * i] = static_cast<uint8_t>(i / 256);
      chroma[2 * i + 1] = static_cast<uint8_t>(i % 256);
    }
  }

  std::vector<uint8_t> luma;
  std::vector<uint8_t> chroma;
};

struct Rows {
  std::vector<uint8_t> min = std::vector<uint8_t>(EveryChroma::kWidth, 0xA5);
  std::vector<uint8_t> max = std::vector<uint8_t>(EveryChroma::kWidth, 0x5A);
};

Rows reference_rows(const EveryChroma& row) {
  Rows result;
  for (size_t i = 0; i < EveryChroma::kWidth; ++i) {
    const reference::MaxMin both =
        reference::max_min_of_sample(row.luma[2 * i], row.chroma[2 * i], row.chroma[2 * i + 1]);
    result.min[i] = both.min;
    result.max[i] = both.max;
  }
  return result;
}

TEST(MaxMinNv21Kernels, PortableRowIsExactForEveryColour) {
  for (int y = 0; y < 256; y += 5) {
    const EveryChroma row(y);
    const Rows expected = reference_rows(row);
    Rows actual;
    color::max_min_row_portable(row.luma.data(), row.chroma.data(), actual.min.data(),
                                actual.max.data(), 0, EveryChroma::kWidth);
    ASSERT_TRUE(bytes_match(actual.min, expected.min, {{"y", y}}));
    ASSERT_TRUE(bytes_match(actual.max, expected.max, {{"y", y}}));
  }
}

TEST(MaxMinNv21Kernels, PortableRowKeepsToItsRange) {
  const EveryChroma row(90);
  Rows actual;
  color::max_min_row_portable(row.luma.data(), row.chroma.data(), actual.min.data(),
                              actual.max.data(), 3, 6);
  for (size_t i = 0; i < EveryChroma::kWidth; ++i) {
    if (i >= 3 && i < 6) continue;
    ASSERT_EQ(actual.min[i], 0xA5);
    ASSERT_EQ(actual.max[i], 0x5A);
  }
}

#if HAZE_NEON
TEST(MaxMinNv21Kernels, NeonRowIsExactForEveryColour) {
  for (int y = 0; y < 256; y += 5) {
    const EveryChroma row(y);
    const Rows expected = reference_rows(row);
    Rows actual;
    ASSERT_EQ(color::max_min_row_neon(row.luma.data(), row.chroma.data(), actual.min.data(),
                                      actual.max.data(), EveryChroma::kWidth),
              EveryChroma::kWidth);
    ASSERT_TRUE(bytes_match(actual.min, expected.min, {{"y", y}}));
    ASSERT_TRUE(bytes_match(actual.max, expected.max, {{"y", y}}));
  }
}

TEST(MaxMinNv21Kernels, NeonRowStopsAtTheLastWholeStep) {
  const EveryChroma row(200);
  for (int width = 0; width < 40; ++width) {
    Rows actual;
    const int done = color::max_min_row_neon(row.luma.data(), row.chroma.data(), actual.min.data(),
                                             actual.max.data(), width);
    EXPECT_EQ(done, width / 8 * 8);
    EXPECT_EQ(actual.min[static_cast<size_t>(done)], 0xA5);
    EXPECT_EQ(actual.max[static_cast<size_t>(done)], 0x5A);
  }
}
#endif

}  // namespace
}  // namespace haze::test
