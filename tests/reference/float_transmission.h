// Running maximum of floats, and the per-pixel float transmission of a colour image.
#pragma once

#include <cstdint>
#include <vector>

namespace haze::reference {

// Maximum over samples i - radius ... i + radius as far as they exist; of equal samples the last,
// which tells a negative zero from a positive one. Samples that are not numbers leave the other
// windows alone.
std::vector<float> window_maximum(const float* line, int count, int radius);

// The same for lines of at least 2 * radius + 1 samples, told by the maximum that is carried along.
// It differs only for samples that are not a number: those never replace the maximum, but one that
// starts a window stays until it has left.
std::vector<float> carried_maximum(const float* line, int count, int radius);

using LineMaximum = std::vector<float> (*)(const float*, int, int);

// Every row or every column of a map.
std::vector<float> maximum_of_columns(const std::vector<float>& map, int width, int height,
                                      int radius, LineMaximum line_maximum = window_maximum);
std::vector<float> maximum_of_rows(const std::vector<float>& map, int width, int height,
                                   int radius);

// 0.0, 0.1, ... 0.9 for the levels 0 ... 9, else 0.3.
float haze_strength(int level);

// 1 - strength / light * value, clamped to 0.4 ... 1.
float channel_transmission(uint8_t value, uint8_t light, float strength);

// The largest of the three channels' transmissions.
std::vector<float> raw_transmission(const uint8_t* image, const uint8_t* light, int width,
                                    int height, int level);

// That, through a maximum filter of 15 x 15 pixels.
std::vector<float> filtered_transmission(const std::vector<float>& raw, int width, int height);

}  // namespace haze::reference
