// Sizes and contents for calls of the building blocks.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "tests/support/float_planes.h"
#include "tests/surface/choices.h"

namespace haze::test {

struct Size {
  int width;
  int height;

  size_t area() const { return static_cast<size_t>(width) * static_cast<size_t>(height); }
  Size half() const { return {width / 2, height / 2}; }
  Size half_rounded_up() const { return {(width + 1) / 2, (height + 1) / 2}; }
};

// Most are small, some a few rows of up to 1400 pixels. Sides are at least `least`.
Size draw_size(Choices& choices, int least = 1);
Size draw_even_size(Choices& choices);

// One side or both are 0 or negative.
Size draw_empty_size(Choices& choices);

// One of those, or an odd side: no image of whole 2 x 2 blocks.
Size draw_size_without_blocks(Choices& choices);

// Now and then true: the call is to be one that does nothing.
bool draws_nothing(Choices& choices);

// A slot, or now and then a number that is none.
int draw_slot(Choices& choices, bool& is_slot);

// Bytes of a mood, or those of the choices over and over.
std::vector<uint8_t> draw_bytes(Choices& choices, int width, int height);

// Zero or with squares that are normal numbers.
std::vector<float> draw_plane(Choices& choices, Size size);

}  // namespace haze::test
