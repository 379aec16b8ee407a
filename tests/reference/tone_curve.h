// The brightening tone curve, kept apart from the library's own table.
#pragma once

#include <cstdint>

namespace haze::reference {

extern const uint8_t kToneCurve[256];

}  // namespace haze::reference
