// Logarithmic brightness lift.
#include <math.h>
#include <stddef.h>
#include <stdint.h>

#include "core/image_size.h"
#include "haze_preview.h"
#include "recover/brightness_kernels.h"

namespace {

// v * log(v + 1) / log(2 + 8 v / 230) * 0.423, truncated and clamped to a byte. The base of the
// logarithm grows with v: an adaptive logarithmic mapping that lifts dark and middle tones. The
// last factor makes the curve end near 255.
uint8_t lifted(int value) {
  const double gain = log(value + 1.0) / log(2.0 + value / 230.0 * 8.0) * 0.42308129542259015;
  const double result = value * gain;
  return static_cast<uint8_t>(result > 255.0 ? 255.0 : result < 0.0 ? 0.0 : result);
}

}  // namespace

void ImproveBrightnessPreview(unsigned char* buf, int w, int h) {
  const size_t count = haze::pixel_count(w, h);
  if (count == 0) return;
  uint8_t table[256];
  for (int value = 0; value < 256; ++value) table[value] = lifted(value);
  haze::recover::look_up_first_bytes(buf, table, count);
}
