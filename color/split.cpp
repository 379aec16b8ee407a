// Four-channel images as planes.
#include <stddef.h>

#include "core/image_size.h"
#include "haze_preview.h"

void split_4componentPreview(unsigned char* src, unsigned char* planes, int width, int height) {
  const size_t count = haze::pixel_count(width, height);
  for (size_t i = 0; i < count; ++i)
    for (size_t plane = 0; plane < 4; ++plane) planes[plane * count + i] = src[4 * i + plane];
}
