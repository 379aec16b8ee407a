#include "core/simd_avx512.h"
#include "estimate/transmission_x86.h"

namespace haze::estimate {

size_t group_codes_avx512(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, size_t end,
                          float strength, float minus_inv_a) {
  return group_codes_x86<Avx512>(mean, minimum, codes, end, strength, minus_inv_a);
}

}  // namespace haze::estimate
