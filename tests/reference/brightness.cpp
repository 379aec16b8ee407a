#include "tests/reference/brightness.h"

#include <cmath>

namespace haze::reference {

double lifted(uint8_t value) {
  const double v = value;
  const double share = v / 230.0;
  const double base = 2.0 + share * 8.0;
  const double gain = std::log(v + 1.0) / std::log(base) * 0.42308129542259015;
  return v * gain;
}

uint8_t lifted_byte(uint8_t value) {
  const double x = lifted(value);
  if (x > 255.0) return 255;
  if (x < 0.0) return 0;
  return static_cast<uint8_t>(x);
}

}  // namespace haze::reference
