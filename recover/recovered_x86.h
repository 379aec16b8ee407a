// Recovered samples for x86-64, by vector type: what the vector paths of all recoveries share.
#pragma once

#include <stdint.h>

namespace haze::recover {

// How samples are recovered around an anchor. Each gives 32-bit integers that still have to be
// clamped to 0 ... 255.

// trunc(anchor + (sample - anchor) * factor)
template <typename V>
struct ByFactor {
  using Float = typename V::Float;
  static typename V::Int recovered(const uint8_t* samples, Float anchor, Float factor) {
    return V::truncate(V::add(anchor, V::mul(V::sub(V::load_bytes(samples), anchor), factor)));
  }
};

// trunc(anchor + (sample - anchor) / t). The quotient may be huge or not a number: it is cut at 255
// first, and what is not a number becomes the least integer.
template <typename V>
struct ByDivision {
  using Float = typename V::Float;
  static typename V::Int recovered(const uint8_t* samples, Float anchor, Float t) {
    const Float value = V::add(anchor, V::div(V::sub(V::load_bytes(samples), anchor), t));
    return V::truncate(V::min(V::set_float(255.0f), value));
  }
};

// anchor + ((sample - anchor) * k >> 8) for whole k up to 2^16: the product, below 2^24 in size, is
// exact in single precision.
template <typename V>
struct ByReciprocal {
  using Float = typename V::Float;
  static typename V::Int recovered(const uint8_t* samples, Float anchor, Float k) {
    const Float product = V::mul(V::sub(V::load_bytes(samples), anchor), k);
    return V::add32(V::template shift_right32<8>(V::truncate(product)), V::truncate(anchor));
  }
};

// kBytes neighbouring samples, clamped.
template <typename V, typename How>
typename V::Int recovered_row(const uint8_t* samples, typename V::Float anchor,
                              const typename V::Float (&factors)[4]) {
  const typename V::Int quarters[4] = {
      How::recovered(samples, anchor, factors[0]),
      How::recovered(samples + V::kFloats, anchor, factors[1]),
      How::recovered(samples + 2 * V::kFloats, anchor, factors[2]),
      How::recovered(samples + 3 * V::kFloats, anchor, factors[3])};
  return V::clamp32(quarters);
}

// Half a vector of samples of each of two planes, in place.
template <typename V, typename How>
void recover_two_planes(uint8_t* first, typename V::Float first_anchor, uint8_t* second,
                        typename V::Float second_anchor, typename V::Float low,
                        typename V::Float high) {
  const typename V::Int quarters[4] = {How::recovered(first, first_anchor, low),
                                       How::recovered(first + V::kFloats, first_anchor, high),
                                       How::recovered(second, second_anchor, low),
                                       How::recovered(second + V::kFloats, second_anchor, high)};
  V::store_halves(first, second, V::clamp32(quarters));
}

}  // namespace haze::recover
