// Every building block with every allocation, and every start of a thread, failing in turn.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>
#include <vector>

#include "tests/faults/fault_points.h"
#include "tests/support/effort.h"
#include "tests/surface/blocks.h"

namespace haze::test {
namespace {

// HAZE_TEST_FAULT_CALLS sets another number of drawn calls for each block.
int calls_per_block() {
  const char* const text = std::getenv("HAZE_TEST_FAULT_CALLS");
  return text != nullptr ? std::atoi(text) : effort(12, 2);
}

constexpr size_t kChoices = 120;

enum class Promise { kResult, kResultOrNothing };

// Draws the call of these choices anew and runs it with faults. Returns what was counted.
FaultCounts run_with_faults(const Block& block, const std::vector<uint8_t>& bytes,
                            Failing allocations, Failing threads, Promise promise) {
  Choices choices(bytes.data(), bytes.size());
  Call call(Placement::kPageEnd);
  block.draw(choices, call);
  call.prepare();
  arm_faults(allocations, threads);
  call.run();
  const FaultCounts counts = disarm_faults();
  EXPECT_EQ(counts.live, 0) << "memory that was not given back";
  EXPECT_EQ(counts.overrun, 0) << "memory of its own that was written past its end";
  EXPECT_EQ(counts.unjoined, 0) << "threads that were not joined";
  if (promise == Promise::kResult || !call.untouched()) {
    EXPECT_EQ(call.difference(), "");
  }
  return counts;
}

class FaultRun {
 public:
  using Kind = int FaultCounts::*;

  explicit FaultRun(Kind kind) : kind_(kind) {}

  // Each call of the kind alone, then it and all after it.
  void run(const Block& block, const std::vector<uint8_t>& bytes,
           const std::function<FaultCounts(Failing)>& with) {
    const int count = with(Failing{}).*kind_;
    for (int first = 0; first < count && !::testing::Test::HasFailure(); ++first)
      for (const bool later : {false, true}) {
        with({first, later});
        ++injected_;
        EXPECT_FALSE(::testing::Test::HasFailure())
            << block.name << ", call " << first << " of " << count << (later ? " and later" : "")
            << ", " << bytes.size() << " bytes of choices";
      }
  }

  int injected() const { return injected_; }

 private:
  Kind kind_;
  int injected_ = 0;
};

TEST(SurfaceFaults, EveryAllocationInTurn) {
  FaultRun faults(&FaultCounts::allocations);
  Random random(test_seed());
  for (const Block& block : all_blocks())
    for (int i = 0; i < calls_per_block() && !HasFailure(); ++i) {
      const std::vector<uint8_t> bytes = draw_choices(random, kChoices);
      faults.run(block, bytes, [&](Failing failing) {
        return run_with_faults(block, bytes, failing, {}, Promise::kResultOrNothing);
      });
    }
  std::printf("%d allocation failures injected\n", faults.injected());
  EXPECT_GT(faults.injected(), 0);
}

TEST(SurfaceFaults, EveryThreadInTurn) {
  FaultRun faults(&FaultCounts::threads);
  Random random(test_seed());
  for (const Block& block : all_blocks())
    for (int i = 0; i < calls_per_block() && !HasFailure(); ++i) {
      const std::vector<uint8_t> bytes = draw_choices(random, kChoices);
      faults.run(block, bytes, [&](Failing failing) {
        return run_with_faults(block, bytes, {}, failing, Promise::kResult);
      });
    }
  std::printf("%d thread failures injected\n", faults.injected());
  EXPECT_GT(faults.injected(), 0);
}

}  // namespace
}  // namespace haze::test
