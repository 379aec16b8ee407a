// The vector paths that an input takes.
#pragma once

#include <cstdint>

#include "core/cpu_level.h"

namespace haze::fuzz {

// One of the processor's levels by a byte of the input; ARM has one.
inline void choose_level(uint8_t byte) {
#if HAZE_X86
  limit_cpu_level(static_cast<CpuLevel>(byte % 3));
#else
  (void)byte;
#endif
}

}  // namespace haze::fuzz
