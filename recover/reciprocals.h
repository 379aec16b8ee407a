// Reciprocals in fixed point: 2^16 / n, the inverse transmission by its 8-bit index.
#pragma once

#include <stdint.h>

namespace haze::recover {

class Reciprocals {
 public:
  // floor(65536 / n); index 0 has the value of index 1.
  constexpr Reciprocals() : values_() {
    values_[0] = 65536;
    for (int n = 1; n < 256; ++n) values_[n] = 65536 / n;
  }
  constexpr int32_t operator[](int index) const { return values_[index]; }

 private:
  int32_t values_[256];
};

inline constexpr Reciprocals kReciprocals;

}  // namespace haze::recover
