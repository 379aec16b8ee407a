// Kernels of the brightness lift.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"

namespace haze::recover {

// Looks up the first byte of the 2-byte pixels [begin, end).
inline void look_up_first_bytes_portable(uint8_t* pixels, const uint8_t* table, size_t begin,
                                         size_t end) {
  for (size_t i = begin; i < end; ++i) pixels[2 * i] = table[pixels[2 * i]];
}

#if HAZE_X86
// Same bytes; each returns the first pixel that it did not change.
size_t look_up_first_bytes_avx2(uint8_t* pixels, const uint8_t* table, size_t end);
size_t look_up_first_bytes_avx512(uint8_t* pixels, const uint8_t* table, size_t end);
#endif

inline void look_up_first_bytes(uint8_t* pixels, const uint8_t* table, size_t count) {
  size_t done = 0;
#if HAZE_X86
  if (const auto kernel = x86_kernel(look_up_first_bytes_avx2, look_up_first_bytes_avx512))
    done = kernel(pixels, table, count);
#endif
  look_up_first_bytes_portable(pixels, table, done, count);
}

}  // namespace haze::recover
