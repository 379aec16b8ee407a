// Inputs of the benchmarks: synthetic, the same on every run.
#pragma once

#include <memory>
#include <vector>

#include "bench/case.h"

namespace haze::bench {

inline size_t area(Size size) {
  return static_cast<size_t>(size.width) * static_cast<size_t>(size.height);
}

inline Size half(Size size) { return {size.width / 2, size.height / 2}; }

// An NV21 frame of shapes behind haze that grows with the height, with a little noise.
Bytes hazy_frame(Size size);

// `channels` bytes per pixel with the statistics of such a frame.
Bytes hazy_image(Size size, int channels);

// Floats in [0, 1] of the same kind; transmissions in [0.4, 1].
std::vector<float> float_plane(Size size);
std::vector<float> transmission_plane(Size size);

// Transmission codes, 40 ... 158.
Bytes code_map(Size size);

// Shared by the functions of a case, which outlive the function that makes them.
template <typename T>
std::shared_ptr<T> shared(T value) {
  return std::make_shared<T>(std::move(value));
}

inline Bytes bytes_of(const std::vector<float>& floats) {
  const auto* first = reinterpret_cast<const uint8_t*>(floats.data());
  return {first, first + floats.size() * sizeof(float)};
}

}  // namespace haze::bench
