// Recovered samples for x86-64, by vector type: what the vector paths of all recoveries share.
#pragma once

#include <stdint.h>

namespace haze::recover {

// Where bytes become floats by their bits alone, they come as 2^23 + byte.
constexpr float kByteOffset = 8388608.0f;

// How samples are recovered around an anchor. Each takes kByteOffset + sample and gives 32-bit
// integers that still have to be clamped to 0 ... 255. An anchor that is whole costs one
// subtraction for both the offset and itself, exactly.

// trunc(anchor + (sample - anchor) * factor), for whole anchors.
template <typename V>
struct ByFactor {
  using Float = typename V::Float;
  Float anchor;
  Float offset = V::add(anchor, V::set_float(kByteOffset));

  typename V::Int operator()(Float sample, Float factor) const {
    return V::truncate(V::add(anchor, V::mul(V::sub(sample, offset), factor)));
  }
};

// The same for any anchor.
template <typename V>
struct ByFactorAnyAnchor {
  using Float = typename V::Float;
  Float anchor;

  typename V::Int operator()(Float sample, Float factor) const {
    const Float difference = V::sub(V::sub(sample, V::set_float(kByteOffset)), anchor);
    return V::truncate(V::add(anchor, V::mul(difference, factor)));
  }
};

// trunc(anchor + (sample - anchor) / t), for whole anchors. The quotient may be huge or not a
// number: it is cut at 255 first, and what is not a number becomes the least integer.
template <typename V>
struct ByDivision {
  using Float = typename V::Float;
  Float anchor;
  Float offset = V::add(anchor, V::set_float(kByteOffset));

  typename V::Int operator()(Float sample, Float t) const {
    const Float value = V::add(anchor, V::div(V::sub(sample, offset), t));
    return V::truncate(V::min(V::set_float(255.0f), value));
  }
};

// anchor + ((sample - anchor) * k >> 8) for whole anchors and whole k up to 2^16: the product,
// below 2^24 in size, is exact in single precision.
template <typename V>
struct ByReciprocal {
  using Float = typename V::Float;
  Float anchor;
  Float offset = V::add(anchor, V::set_float(kByteOffset));
  typename V::Int whole_anchor = V::truncate(anchor);

  typename V::Int operator()(Float sample, Float k) const {
    const Float product = V::mul(V::sub(sample, offset), k);
    return V::add32(V::template shift_right32<8>(V::truncate(product)), whole_anchor);
  }
};

// kBytes samples, clamped; `factors` in the order of V::split_bytes.
template <typename V, typename How>
typename V::Int recovered(typename V::Int samples, How how, const typename V::Float (&factors)[4]) {
  typename V::Float floats[4];
  V::split_bytes(samples, floats);
  const typename V::Int quarters[4] = {how(floats[0], factors[0]), how(floats[1], factors[1]),
                                       how(floats[2], factors[2]), how(floats[3], factors[3])};
  return V::join_clamped(quarters);
}

}  // namespace haze::recover
