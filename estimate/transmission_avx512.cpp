#include "core/simd_avx512.h"
#include "estimate/transmission_x86.h"

namespace haze::estimate {

size_t look_up_codes_avx512(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                            const uint8_t* of_mean, const uint8_t* of_minimum) {
  return look_up_codes_x86<Avx512>(mean, minimum, codes, end, of_mean, of_minimum);
}

}  // namespace haze::estimate
