// Per-pixel definition of the zoom: frames to half-resolution BGR by stripes, float planes to twice
// their size.
#pragma once

#include <cstdint>

#include "tests/reference/channel_maps.h"

namespace haze::reference {

// Luma rows that stripe 0 ... 7 converts. Stripe 3 takes the remainder, so it reaches into the
// stripes after it and the frame's last rows may belong to no stripe.
ImageRows zoom_out_stripe(int height, int stripe);

// Converts the output pixels of the given luma rows of a frame with even sides.
void zoom_out_rows(const uint8_t* frame, uint8_t* bgr, int width, int height, bool planar,
                   ImageRows luma_rows);

// All stripes.
void zoom_out(const uint8_t* frame, uint8_t* bgr, int width, int height, bool planar);

void zoom_in(const float* src, float* dst, int width, int height);

}  // namespace haze::reference
