// Division by the window counts of the 64 x 64 mean.
#include "filter/reciprocals_64.h"

#include <gtest/gtest.h>

namespace haze::test {
namespace {

using filter::kReciprocals64;
using filter::Reciprocals64;

// The quotient never falls as the sum grows, so it is exact everywhere if it is exact at every
// multiple of the count and just below it.
TEST(Reciprocals64, EveryCountDividesEverySumExactly) {
  for (int rows = 32; rows <= 64; ++rows)
    for (int columns = 32; columns <= 64; ++columns) {
      const uint32_t count = static_cast<uint32_t>(rows * columns);
      const uint32_t reciprocal = kReciprocals64.row(rows)[columns - 32];
      for (uint32_t mean = 1; mean <= 255; ++mean) {
        ASSERT_EQ(Reciprocals64::divide(mean * count, reciprocal), mean) << rows << 'x' << columns;
        ASSERT_EQ(Reciprocals64::divide(mean * count - 1, reciprocal), mean - 1)
            << rows << 'x' << columns;
      }
      ASSERT_EQ(Reciprocals64::divide(0, reciprocal), 0u);
    }
}

TEST(Reciprocals64, TheFullWindowIsAShiftByTwelve) {
  EXPECT_EQ(kReciprocals64.row(64)[32], 1u << 20);
}

}  // namespace
}  // namespace haze::test
