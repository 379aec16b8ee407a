#include <gtest/gtest.h>

#include "haze_preview.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"

namespace haze::test {
namespace {

TEST(ToneCurve, EveryEntry) {
  EXPECT_TRUE(bytes_match({LutTablePreview, 256}, {reference::kToneCurve, 256}, {{"row", 16}}));
}

TEST(ToneCurve, NeverFalls) {
  for (int i = 1; i < 256; ++i) EXPECT_GE(LutTablePreview[i], LutTablePreview[i - 1]) << i;
}

TEST(ToneCurve, LiftsTheMiddleAndCapsTheTop) {
  EXPECT_EQ(LutTablePreview[0], 0);
  EXPECT_EQ(LutTablePreview[22], 28);
  EXPECT_EQ(LutTablePreview[24], 31);
  EXPECT_EQ(LutTablePreview[100], 114);
  EXPECT_EQ(LutTablePreview[128], 141);
  EXPECT_EQ(LutTablePreview[201], 205);
  EXPECT_EQ(LutTablePreview[255], 250);
}

}  // namespace
}  // namespace haze::test
