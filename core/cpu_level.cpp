#include "core/cpu_level.h"

#if HAZE_X86
namespace haze {
namespace {

CpuLevel probe() {
  __builtin_cpu_init();
  if (!__builtin_cpu_supports("avx2")) return CpuLevel::kPortable;
  const bool avx512 = __builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512bw") &&
                      __builtin_cpu_supports("avx512dq") && __builtin_cpu_supports("avx512vl") &&
                      __builtin_cpu_supports("avx512vbmi");
  return avx512 ? CpuLevel::kAvx512 : CpuLevel::kAvx2;
}

// Level + 1, 0 while unknown. Threads that find it unknown all write the same value.
int known_level;

void store(CpuLevel level) {
  __atomic_store_n(&known_level, static_cast<int>(level) + 1, __ATOMIC_RELAXED);
}

}  // namespace

CpuLevel cpu_level() {
  const int known = __atomic_load_n(&known_level, __ATOMIC_RELAXED);
  if (known != 0) return static_cast<CpuLevel>(known - 1);
  const CpuLevel level = probe();
  store(level);
  return level;
}

void limit_cpu_level(CpuLevel level) {
  const CpuLevel highest = probe();
  store(level < highest ? level : highest);
}

}  // namespace haze
#endif
