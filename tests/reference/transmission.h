// Per-pixel definition of the 8-bit transmission map: T = trunc(200 t - 40) for t clamped to [0.4,
// 0.99].
#pragma once

#include <cstdint>

namespace haze::reference {

// A pixel of the part of the flat image that is handled in whole groups of eight: not a number
// gives code 0.
uint8_t transmission_in_group(uint8_t mean, uint8_t min, float strength, float inv_light);

// A pixel of the remainder of fewer than eight: not a number gives code 40.
uint8_t transmission_in_tail(uint8_t mean, uint8_t min, float strength, float inv_light);

// A pixel of the integer version; strength_q8 = 256 means 1. Not a number gives code 0.
uint8_t transmission_q8(uint8_t mean, uint8_t min, int strength_q8, int light);

// Pixel i of a group takes the minimum of pixel i (kOwn), or lanes 4-7 take that of lanes 0-3
// (kLowHalfTwice).
enum class GroupMinimum { kOwn, kLowHalfTwice };

void transmission_map(const uint8_t* mean, const uint8_t* min, uint8_t* codes, int width,
                      int height, float strength, float inv_light, GroupMinimum group_minimum);

void transmission_map_q8(const uint8_t* mean, const uint8_t* min, uint8_t* codes, int width,
                         int height, int strength_q8, int light);

// Rows that stripe 0 ... 7 of the threaded version covers.
struct StripeRows {
  int first;
  int count;
};
StripeRows transmission_stripe(int height, int stripe);

}  // namespace haze::reference
