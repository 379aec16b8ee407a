// Kinds of test images, from flat extremes to rough ones.
#pragma once

#include <cstdint>
#include <vector>

#include "tests/support/random.h"

namespace haze::test {

// kBlocks: high contrast plus noise. kSparks: dark with single bright pixels.
enum class Mood { kNearZero, kNearMaximum, kNoise, kBlocks, kGradient, kSparks };

constexpr Mood kMoods[] = {Mood::kNearZero, Mood::kNearMaximum, Mood::kNoise,
                           Mood::kBlocks,   Mood::kGradient,    Mood::kSparks};

void fill_image(Random& random, Mood mood, uint8_t* image, int width, int height);
std::vector<uint8_t> make_image(Random& random, Mood mood, int width, int height);

// Luma in the given mood; chroma in one of its own, or within a few codes of neutral.
enum class Colours { kWild, kMuted };
std::vector<uint8_t> make_frame(Random& random, Mood luma, Colours colours, int width, int height);

// A synthetic view: dark shapes that fade into a bright veil with the distance, plus sensor noise.
std::vector<uint8_t> make_hazy_frame(Random& random, int width, int height);

}  // namespace haze::test
