// Planes of floats: test content, and comparison by bit pattern.
#pragma once

#include <gtest/gtest.h>

#include <cstddef>
#include <initializer_list>
#include <vector>

#include "tests/support/bytes_match.h"
#include "tests/support/random.h"

namespace haze::test {

// None holds, or leads to, a number below the smallest normal one: vector units may take those as
// zero. Products of two planes, and their sums over a frame, stay finite.
enum class FloatMood {
  kUnit,        // 0 ... 1 in steps of 2^-24
  kMixedSigns,  // within +-1024, both signs
  kLarge,       // 10^6 ... 10^12, both signs
  kWideRange,   // magnitudes 2^-20 ... 2^30 side by side, both signs
  kOffset,      // noise on a level of 10^5, which rounds in every sum
  kIntegers,    // 0 ... 255: every sum of a small window is exact
};

constexpr FloatMood kFloatMoods[] = {FloatMood::kUnit,   FloatMood::kMixedSigns,
                                     FloatMood::kLarge,  FloatMood::kWideRange,
                                     FloatMood::kOffset, FloatMood::kIntegers};

float make_float(Random& random, FloatMood mood);
std::vector<float> make_plane(Random& random, FloatMood mood, int width, int height);

// Uniform in first ... last.
float float_between(Random& random, float first, float last);

// The float with the given bits, and the reverse.
float float_of_bits(uint32_t bits);
uint32_t bits_of_float(float value);

// The neighbour `steps` representable numbers up (or down, if negative) of a positive number.
float ulps_from(float value, int steps);

struct Floats {
  Floats(const float* first, size_t count) : data(first), size(count) {}
  template <class Container>
  Floats(const Container& container) : data(container.data()), size(container.size()) {}

  const float* data;
  size_t size;
};

// Equal bits everywhere; two values that are both not a number count as equal, as their bits depend
// on the target. An argument named "row" gives the floats per row, by which the position is told.
::testing::AssertionResult planes_match(const Floats& actual, const Floats& expected,
                                        std::initializer_list<Argument> arguments = {});

// Every byte of every float still has the fill of its buffer.
::testing::AssertionResult floats_are_untouched(const Floats& actual, uint8_t fill,
                                                std::initializer_list<Argument> arguments = {});

}  // namespace haze::test
