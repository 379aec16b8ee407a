// Bounds of bytes and integers. The library has no run-time dependency on the C++ library, and
// these few lines keep <algorithm> out of every translation unit.
#pragma once

#include <stdint.h>

namespace haze {

template <typename T>
constexpr T min(T a, T b) {
  return b < a ? b : a;
}

template <typename T>
constexpr T max(T a, T b) {
  return a < b ? b : a;
}

// `value` limited to the range of a byte.
constexpr uint8_t clamp_to_byte(int value) { return static_cast<uint8_t>(min(max(value, 0), 255)); }

}  // namespace haze
