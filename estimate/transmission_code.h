// The 8-bit code of a transmission t in [0.4, 0.99]: T = trunc(200 * t - 40), 40 ... 158.
#pragma once

#include <stdint.h>

namespace haze::estimate {

inline constexpr float kLeastTransmission = 0.4f;
inline constexpr float kMostTransmission = 0.99f;
inline constexpr float kCodeScale = 200.0f;
inline constexpr float kCodeOffset = 40.0f;
inline constexpr uint8_t kLeastCode = 40;
inline constexpr uint8_t kMostCode = 158;

}  // namespace haze::estimate
