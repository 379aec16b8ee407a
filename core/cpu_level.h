// Which vector paths the processor can run. x86-64 only; ARM decides at compile time.
#pragma once

namespace haze {

enum class CpuLevel {
  kPortable,
  kAvx2,
  kAvx512,  // F, BW, DQ, VL and VBMI
};

#if defined(__x86_64__) && !defined(HAZE_PREVIEW_PORTABLE)
#define HAZE_X86 1
// The highest level that the processor and limit_cpu_level() allow. Probed once.
CpuLevel cpu_level();

// Keeps to this level or a lower one from now on, for tests and benchmarks. Not to be called while
// other threads are in the library.
void limit_cpu_level(CpuLevel level);

// The vector path to take at the present level; null for the portable path.
template <typename Kernel>
inline Kernel* x86_kernel(Kernel& avx2, Kernel& avx512) {
  switch (cpu_level()) {
    case CpuLevel::kAvx512:
      return &avx512;
    case CpuLevel::kAvx2:
      return &avx2;
    case CpuLevel::kPortable:
      break;
  }
  return nullptr;
}
#else
#define HAZE_X86 0
#endif

}  // namespace haze
