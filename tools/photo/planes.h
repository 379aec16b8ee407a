// The images that the photo engine works on.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace dehaze {

// 3 bytes per pixel: blue, green, red.
struct BgrImage {
  BgrImage(int image_width, int image_height)
      : width(image_width),
        height(image_height),
        bytes(3 * static_cast<size_t>(image_width) * static_cast<size_t>(image_height)) {}

  int width;
  int height;
  std::vector<uint8_t> bytes;
};

struct Plane {
  Plane(int plane_width, int plane_height)
      : width(plane_width),
        height(plane_height),
        values(static_cast<size_t>(plane_width) * static_cast<size_t>(plane_height)) {}

  int width;
  int height;
  std::vector<float> values;
};

}  // namespace dehaze
