#include "color/channel_maps_x86.h"
#include "core/simd_avx2.h"

namespace haze::color {

size_t min_map_avx2(const uint8_t* pixels, uint8_t* min_map, size_t end) {
  return min_map_x86<Avx2>(pixels, min_map, end);
}

size_t min_max_maps_avx2(const uint8_t* pixels, uint8_t* min_map, uint8_t* max_map, size_t end) {
  return min_max_maps_x86<Avx2>(pixels, min_map, max_map, end);
}

}  // namespace haze::color
