// Per-pixel definition of the minimum and maximum maps of images with three bytes per pixel.
#pragma once

#include <cstdint>

namespace haze::reference {

uint8_t min_of_pixel(const uint8_t* pixel);
uint8_t max_of_pixel(const uint8_t* pixel);

struct ImageRows {
  int first;
  int count;
};
constexpr ImageRows all_rows(int height) { return {0, height}; }

// Rows that stripe 0 ... stripes - 1 covers: even counts but for the last one, which takes the
// rest.
ImageRows even_stripe_rows(int height, int stripes, int stripe);

// Maps of the given rows; either map may be null.
void channel_maps(const uint8_t* src, uint8_t* min_map, uint8_t* max_map, int width,
                  ImageRows rows);

}  // namespace haze::reference
