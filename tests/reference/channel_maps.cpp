#include "tests/reference/channel_maps.h"

namespace haze::reference {

uint8_t min_of_pixel(const uint8_t* pixel) {
  uint8_t least = 255;
  for (int c = 0; c < 3; ++c)
    if (pixel[c] < least) least = pixel[c];
  return least;
}

uint8_t max_of_pixel(const uint8_t* pixel) {
  uint8_t greatest = 0;
  for (int c = 0; c < 3; ++c)
    if (pixel[c] > greatest) greatest = pixel[c];
  return greatest;
}

ImageRows even_stripe_rows(int height, int stripes, int stripe) {
  const int even = height / stripes / 2 * 2;
  return {stripe * even, stripe == stripes - 1 ? height - stripe * even : even};
}

void channel_maps(const uint8_t* src, uint8_t* min_map, uint8_t* max_map, int width,
                  ImageRows rows) {
  for (int y = rows.first; y < rows.first + rows.count; ++y)
    for (int x = 0; x < width; ++x) {
      const int at = y * width + x;
      if (min_map != nullptr) min_map[at] = min_of_pixel(src + 3 * at);
      if (max_map != nullptr) max_map[at] = max_of_pixel(src + 3 * at);
    }
}

}  // namespace haze::reference
