// Lights and transmission maps for tests of the recoveries.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "tests/support/random.h"

namespace haze::test {

// B, G, R.
using Light = std::array<uint8_t, 3>;

Light grey_light(int value);
Light random_light(Random& random);

// Codes in first ... last for a frame of the given size.
std::vector<uint8_t> random_codes(Random& random, int width, int height, int first, int last);

enum class TransmissionMood {
  kUsual,       // 0.1 ... 1
  kDense,       // 1 / 256 ... 0.1
  kFlat,        // one value
  kIndexSteps,  // within a few units in the last place of where an index of the reciprocals changes
  kSumSteps,    // sums of neighbours within a few such units of where an index changes
  kOutside,     // zeros, negative, huge, infinite and not a number
};

constexpr TransmissionMood kTransmissionMoods[] = {
    TransmissionMood::kUsual,      TransmissionMood::kDense,    TransmissionMood::kFlat,
    TransmissionMood::kIndexSteps, TransmissionMood::kSumSteps, TransmissionMood::kOutside};

// One transmission per 2 x 2 block of a frame of width x height pixels.
std::vector<float> make_transmissions(Random& random, TransmissionMood mood, int width, int height);

}  // namespace haze::test
