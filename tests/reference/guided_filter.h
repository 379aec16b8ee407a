// Per-pixel definition of the guided filter (after the guided-filter paper of 2010) with an 8-bit
// result.
#pragma once

#include <cstdint>
#include <vector>

namespace haze::reference {

// Slope of the local linear model from the means of guide, filtered plane, their product and the
// filtered plane's square. The moment is that of the filtered plane, the subtracted mean that of
// the guide.
float guided_slope(float mean_guide, float mean_plane, float mean_product, float mean_plane_square);

// Code of a filtered value: 158 above 0.99, else 200 * v - 40 without its fraction, at least 0; 0
// for not a number.
uint8_t guided_code(float value);

// Limits as for the float box filter.
std::vector<uint8_t> guided_filter(const float* plane, const float* guide, int width, int height,
                                   int radius);

}  // namespace haze::reference
