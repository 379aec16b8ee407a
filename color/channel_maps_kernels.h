// Kernels of the per-pixel minimum and maximum of three interleaved channels.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/target.h"

namespace haze::color {

inline uint8_t least_of_three(const uint8_t* pixel) {
  return min(min(pixel[0], pixel[1]), pixel[2]);
}

inline uint8_t most_of_three(const uint8_t* pixel) {
  return max(max(pixel[0], pixel[1]), pixel[2]);
}

// Pixels [begin, end).
inline void min_map_portable(const uint8_t* pixels, uint8_t* min_map, size_t begin, size_t end) {
  for (size_t i = begin; i < end; ++i) min_map[i] = least_of_three(pixels + 3 * i);
}

inline void min_max_maps_portable(const uint8_t* pixels, uint8_t* min_map, uint8_t* max_map,
                                  size_t begin, size_t end) {
  for (size_t i = begin; i < end; ++i) {
    min_map[i] = least_of_three(pixels + 3 * i);
    max_map[i] = most_of_three(pixels + 3 * i);
  }
}

#if HAZE_NEON
// Same bytes, sixteen pixels a step; both return the first pixel that they did not write.
inline size_t min_map_neon(const uint8_t* pixels, uint8_t* min_map, size_t end) {
  size_t i = 0;
  for (; i + 16 <= end; i += 16) {
    const uint8x16x3_t c = vld3q_u8(pixels + 3 * i);
    vst1q_u8(min_map + i, vminq_u8(vminq_u8(c.val[0], c.val[1]), c.val[2]));
  }
  return i;
}

inline size_t min_max_maps_neon(const uint8_t* pixels, uint8_t* min_map, uint8_t* max_map,
                                size_t end) {
  size_t i = 0;
  for (; i + 16 <= end; i += 16) {
    const uint8x16x3_t c = vld3q_u8(pixels + 3 * i);
    vst1q_u8(min_map + i, vminq_u8(vminq_u8(c.val[0], c.val[1]), c.val[2]));
    vst1q_u8(max_map + i, vmaxq_u8(vmaxq_u8(c.val[0], c.val[1]), c.val[2]));
  }
  return i;
}
#endif

#if HAZE_X86
// Same bytes; each returns the first pixel that it did not write.
size_t min_map_avx2(const uint8_t* pixels, uint8_t* min_map, size_t end);
size_t min_map_avx512(const uint8_t* pixels, uint8_t* min_map, size_t end);
size_t min_max_maps_avx2(const uint8_t* pixels, uint8_t* min_map, uint8_t* max_map, size_t end);
size_t min_max_maps_avx512(const uint8_t* pixels, uint8_t* min_map, uint8_t* max_map, size_t end);
#endif

inline void min_map(const uint8_t* pixels, uint8_t* least, size_t count) {
  size_t done = 0;
#if HAZE_NEON
  done = min_map_neon(pixels, least, count);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(min_map_avx2, min_map_avx512))
    done = kernel(pixels, least, count);
#endif
  min_map_portable(pixels, least, done, count);
}

inline void min_max_maps(const uint8_t* pixels, uint8_t* least, uint8_t* most, size_t count) {
  size_t done = 0;
#if HAZE_NEON
  done = min_max_maps_neon(pixels, least, most, count);
#elif HAZE_X86
  if (const auto kernel = x86_kernel(min_max_maps_avx2, min_max_maps_avx512))
    done = kernel(pixels, least, most, count);
#endif
  min_max_maps_portable(pixels, least, most, done, count);
}

}  // namespace haze::color
