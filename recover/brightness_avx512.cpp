#include "core/simd_avx512.h"
#include "recover/brightness_x86.h"

namespace haze::recover {

size_t look_up_first_bytes_avx512(uint8_t* pixels, const uint8_t* table, size_t end) {
  return look_up_first_bytes_x86<Avx512>(pixels, table, end);
}

}  // namespace haze::recover
