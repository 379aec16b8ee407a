// The square minimum filter of the dark-channel-prior paper of 2009, window by window.
#pragma once

#include <cstdint>
#include <vector>

namespace haze::reference {

// Minimum over the samples i - radius ... i + radius that exist.
std::vector<uint8_t> line_minimum(const uint8_t* line, int count, int radius);

// The same over rows or columns of an image with packed rows.
std::vector<uint8_t> row_minimum(const uint8_t* image, int width, int height, int radius);
std::vector<uint8_t> column_minimum(const uint8_t* image, int width, int height, int radius);

// Minimum over the square window, clipped to the image: the minimum of the rows' minima.
std::vector<uint8_t> square_minimum(const uint8_t* image, int width, int height, int radius);

// 256 bins.
std::vector<int> histogram_of(const uint8_t* bytes, int count);

// Histogram of columns first ... first + count - 1.
std::vector<int> histogram_of_columns(const uint8_t* image, int width, int height, int first,
                                      int count);

}  // namespace haze::reference
