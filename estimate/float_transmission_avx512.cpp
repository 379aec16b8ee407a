#include "core/simd_avx512.h"
#include "estimate/float_transmission_x86.h"

namespace haze::estimate {

size_t largest_transmissions_avx512(const uint8_t* pixels, const float* scales, float least,
                                    float* t, size_t end) {
  return largest_transmissions_x86<Avx512>(pixels, scales, least, t, end);
}

}  // namespace haze::estimate
