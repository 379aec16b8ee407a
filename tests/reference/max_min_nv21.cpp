#include "tests/reference/max_min_nv21.h"

#include <algorithm>
#include <cstddef>

namespace haze::reference {
namespace {

// floor(value / 2^14) without shifting a negative number.
int floor_div_16384(int value) { return value >= 0 ? value / 16384 : -((16383 - value) / 16384); }

int clamp_to_byte(int value) { return std::min(std::max(value, 0), 255); }

}  // namespace

MaxMin max_min_of_sample(int y, int cr, int cb) {
  const int v = cr - 128;
  const int u = cb - 128;
  const int b = clamp_to_byte(floor_div_16384(y * 16384 + 8192 + 29049 * u));
  const int g = clamp_to_byte(floor_div_16384(y * 16384 + 8192 - (11698 * v + 5636 * u)));
  const int r = clamp_to_byte(floor_div_16384(y * 16384 + 8192 + 22987 * v));
  return {static_cast<uint8_t>(std::max(b, std::max(g, r))),
          static_cast<uint8_t>(std::min(b, std::min(g, r)))};
}

void max_min_nv21(const uint8_t* luma, const uint8_t* chroma, uint8_t* min_out, uint8_t* max_out,
                  int width, int height) {
  const int half_width = width / 2;
  const int half_height = height / 2;
  for (int row = 0; row < half_height; ++row) {
    const ptrdiff_t luma_start = static_cast<ptrdiff_t>(row) * (2 * half_width + width);
    const ptrdiff_t chroma_start = static_cast<ptrdiff_t>(row) * (2 * half_width);
    for (int k = 0; k < half_width; ++k) {
      const MaxMin sample = max_min_of_sample(
          luma[luma_start + 2 * k], chroma[chroma_start + 2 * k], chroma[chroma_start + 2 * k + 1]);
      min_out[row * half_width + k] = sample.min;
      max_out[row * half_width + k] = sample.max;
    }
  }
}

}  // namespace haze::reference
