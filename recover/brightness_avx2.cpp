#include "core/simd_avx2.h"
#include "recover/brightness_x86.h"

namespace haze::recover {

size_t look_up_first_bytes_avx2(uint8_t* pixels, const uint8_t* table, size_t end) {
  return look_up_first_bytes_x86<Avx2>(pixels, table, end);
}

}  // namespace haze::recover
