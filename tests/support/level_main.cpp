// Runs the tests at one level of the x86-64 vector paths:  --cpu_level=portable|avx2|avx512
//
// On a processor that lacks the level, the tests run at the highest one that it has.
#include <gtest/gtest.h>

#include <cstdio>
#include <cstring>

#include "core/cpu_level.h"

namespace {

constexpr char kFlag[] = "--cpu_level=";

int wrong_usage(const char* argument) {
  std::fprintf(stderr, "unknown argument %s; --cpu_level= takes portable, avx2 or avx512\n",
               argument);
  return 2;
}

bool set_level(const char* name) {
#if HAZE_X86
  using haze::CpuLevel;
  const struct {
    const char* name;
    CpuLevel level;
  } levels[] = {
      {"portable", CpuLevel::kPortable}, {"avx2", CpuLevel::kAvx2}, {"avx512", CpuLevel::kAvx512}};
  for (const auto& choice : levels) {
    if (std::strcmp(name, choice.name) != 0) continue;
    haze::limit_cpu_level(choice.level);
    if (haze::cpu_level() != choice.level)
      std::printf("This processor has no %s; testing the highest level that it has.\n", name);
    return true;
  }
#else
  (void)name;
#endif
  return false;
}

}  // namespace

int main(int argc, char** argv) {
  testing::InitGoogleTest(&argc, argv);
  for (int i = 1; i < argc; ++i) {
    const bool is_level = std::strncmp(argv[i], kFlag, sizeof kFlag - 1) == 0;
    if (!is_level || !set_level(argv[i] + sizeof kFlag - 1)) return wrong_usage(argv[i]);
  }
  return RUN_ALL_TESTS();
}
