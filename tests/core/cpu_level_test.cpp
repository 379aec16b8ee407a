#include "core/cpu_level.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace haze::test {
namespace {

#if HAZE_X86
constexpr CpuLevel kLevels[] = {CpuLevel::kPortable, CpuLevel::kAvx2, CpuLevel::kAvx512};

int name_of_kernel(CpuLevel level) {
  static int avx2, avx512;
  limit_cpu_level(level);
  const int* const kernel = x86_kernel(avx2, avx512);
  return kernel == nullptr ? 0 : kernel == &avx2 ? 1 : 2;
}

// The other tests run at the level that the command line names.
class CpuLevels : public ::testing::Test {
 protected:
  CpuLevels() : level_(cpu_level()) {}
  ~CpuLevels() override { limit_cpu_level(level_); }

 private:
  CpuLevel level_;
};

TEST_F(CpuLevels, ALimitIsKeptOrTheHighestLevelBelowIt) {
  limit_cpu_level(CpuLevel::kAvx512);
  const CpuLevel highest = cpu_level();
  for (const CpuLevel level : kLevels) {
    limit_cpu_level(level);
    for (int i = 0; i < 2; ++i) EXPECT_EQ(cpu_level(), std::min(level, highest));
  }
}

TEST_F(CpuLevels, EachHasItsKernel) {
  limit_cpu_level(CpuLevel::kAvx512);
  const int highest = static_cast<int>(cpu_level());
  for (const CpuLevel level : kLevels)
    EXPECT_EQ(name_of_kernel(level), std::min(static_cast<int>(level), highest));
}
#endif

}  // namespace
}  // namespace haze::test
