// The split of an image into stripes, and the code that tells a worker its slot and stripe.
#include "core/stripes.h"

#include <gtest/gtest.h>

#include <atomic>

namespace haze::test {
namespace {

void expect_even_split(int height, int stripes) {
  SCOPED_TRACE(testing::Message() << height << " rows, " << stripes << " stripes");
  const int rows = height / stripes - height / stripes % 2;
  int next = 0;
  for (int i = 0; i < stripes; ++i) {
    const StripeRange range = even_stripe(height, stripes, i);
    ASSERT_EQ(range.begin, next);
    ASSERT_EQ(range.begin % 2, 0);
    ASSERT_EQ(range.end - range.begin, i < stripes - 1 ? rows : height - (stripes - 1) * rows);
    next = range.end;
  }
  ASSERT_EQ(next, height);
}

TEST(Stripes, EverySplitCoversTheImageInEvenSteps) {
  for (int height = 1; height <= 2000; ++height)
    for (int stripes : {1, 4, 8}) expect_even_split(height, stripes);
}

TEST(Stripes, TwentyRowsOnEightThreads) {
  for (int i = 0; i < 7; ++i) {
    EXPECT_EQ(even_stripe(20, 8, i).begin, 2 * i);
    EXPECT_EQ(even_stripe(20, 8, i).end, 2 * i + 2);
  }
  EXPECT_EQ(even_stripe(20, 8, 7).begin, 14);
  EXPECT_EQ(even_stripe(20, 8, 7).end, 20);
}

TEST(Stripes, CodesTellSlotAndStripe) {
  for (int slot = 0; slot < kSlots; ++slot)
    for (int stripe = 0; stripe < 8; ++stripe) {
      const StripeCode code = decode_stripe(encode_stripe(slot, stripe));
      EXPECT_EQ(code.slot, slot);
      EXPECT_EQ(code.stripe, stripe);
      EXPECT_TRUE(is_stripe(code, 8));
    }
}

TEST(Stripes, CodesOutOfRangeAreNoStripes) {
  for (int code : {-1, -10, 8, 9, 18, 80, 87, 1000, -1000})
    EXPECT_FALSE(is_stripe(decode_stripe(code), 8)) << code;
  EXPECT_FALSE(is_stripe(decode_stripe(4), 4));
}

std::atomic<int> visits[8];

void* count_visit(void* arg) {
  const StripeCode code = decode_stripe(*static_cast<const int*>(arg));
  if (code.slot == 5) ++visits[code.stripe];
  return nullptr;
}

TEST(Stripes, EachStripeRunsOnceBeforeTheCallReturns) {
  for (auto& count : visits) count = 0;
  run_stripes<8>(count_visit, 5);
  for (const auto& count : visits) EXPECT_EQ(count, 1);
}

}  // namespace
}  // namespace haze::test
