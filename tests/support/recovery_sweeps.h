// Sizes and transmission maps that every recovery is tested with.
#pragma once

#include "tests/support/random.h"
#include "tests/support/recovery_inputs.h"

namespace haze::test {

// check(map, width, height) for every even width and every even height up to 40, in every mood.
template <typename Check>
void for_sizes_up_to_40(Random& random, Check check) {
  for (int side = 2; side <= 40; side += 2)
    for (const TransmissionMood mood : kTransmissionMoods) {
      const int other = 2 * random.between(1, 20);
      check(make_transmissions(random, mood, side, other), side, other);
      check(make_transmissions(random, mood, other, side), other, side);
    }
}

// The same for every even width up to 200: every length of what steps of vectors leave over.
template <typename Check>
void for_widths_up_to_200(Random& random, Check check) {
  for (int width = 2; width <= 200; width += 2) {
    const int height = 2 * random.between(1, 3);
    check(make_transmissions(random, random.one_of(kTransmissionMoods), width, height), width,
          height);
  }
}

}  // namespace haze::test
