// The atmospheric light of a dark-channel histogram, and statistics over every second row and
// column.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace haze::reference {

// The most populated of the brightest bins that together hold 0.1 % of the pixels; the brighter one
// of equals.
int brightest_populated_bin(const int* histogram, int pixels);

// Mean colour, truncated, of the pixels whose dark channel is that bin; 255s if there are none.
std::array<uint8_t, 3> estimate_light(const uint8_t* dark, const uint8_t* image,
                                      const int* histogram, int width, int height);

// Calls visit(position) for each sampled byte of stripe 0 ... 7 of a plane. Every second row of the
// stripe is sampled; the position runs on from the end of a scanned row, so that odd widths drift
// to the right. Positions past the plane's end are left out.
template <class Visit>
void for_each_sample(int width, int height, int stripe, const Visit& visit) {
  const int rows = (height + 7) / 8;
  const int first = stripe * rows;
  const int end = stripe < 7 && first + rows < height ? first + rows : height;
  const size_t bytes = static_cast<size_t>(width) * static_cast<size_t>(height);
  for (int row = first; row < end; row += 2) {
    const int drift = (row - first) / 2 * (width % 2);
    for (int column = 0; column < width; column += 2) {
      const size_t position = static_cast<size_t>(row) * static_cast<size_t>(width) +
                              static_cast<size_t>(drift + column);
      if (position < bytes) visit(position);
    }
  }
}

uint32_t sampled_sum(const uint8_t* plane, int width, int height, int stripe);
uint8_t sampled_maximum(const uint8_t* plane, int width, int height, int stripe);

}  // namespace haze::reference
