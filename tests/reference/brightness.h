// Per-byte definition of the logarithmic brightness lift.
#pragma once

#include <cstdint>

namespace haze::reference {

// v * log(v + 1) / log(2 + v / 230 * 8) * 0.423..., before it is cut to a byte.
double lifted(uint8_t value);

uint8_t lifted_byte(uint8_t value);

}  // namespace haze::reference
