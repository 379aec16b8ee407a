// The brightening tone curve, kept apart from the library's own table.
#ifndef HAZE_TESTS_REFERENCE_TONE_CURVE_H
#define HAZE_TESTS_REFERENCE_TONE_CURVE_H

#include <cstdint>

namespace haze::reference {

extern const uint8_t kToneCurve[256];

}  // namespace haze::reference

#endif
