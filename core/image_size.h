// Sizes of packed images.
#pragma once

#include <stddef.h>

namespace haze {

// Pixels of an image, 0 if either side is below 1.
constexpr size_t pixel_count(int width, int height) {
  return width < 1 || height < 1 ? 0 : static_cast<size_t>(width) * static_cast<size_t>(height);
}

// Whether an image is made of whole blocks of 2 x 2 pixels, at least one.
constexpr bool has_blocks(int width, int height) {
  return width >= 2 && height >= 2 && width % 2 == 0 && height % 2 == 0;
}

// Whether both sides hold a window of 2 * radius + 1 pixels, for a radius of at least 1.
constexpr bool holds_window(int width, int height, int radius) {
  return radius >= 1 && width > 0 && height > 0 && radius <= (width - 1) / 2 &&
         radius <= (height - 1) / 2;
}

}  // namespace haze
