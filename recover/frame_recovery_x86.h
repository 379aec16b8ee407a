// Vector path of the frame recovery for x86-64, by vector type: arithmetic in place of tables.
#pragma once

#include <stdint.h>

#include "recover/block_row.h"
#include "recover/light_anchor.h"

namespace haze::recover {

// clamp(trunc(anchor + (sample - anchor) * factor)) of one vector of floats, not clamped yet.
template <typename V>
typename V::Int recovered(const uint8_t* samples, typename V::Float anchor,
                          typename V::Float factor) {
  return V::truncate(V::add(anchor, V::mul(V::sub(V::load_bytes(samples), anchor), factor)));
}

// kBytes neighbouring samples.
template <typename V>
typename V::Int recovered_row(const uint8_t* samples, typename V::Float anchor,
                              const typename V::Float (&factors)[4]) {
  const typename V::Int quarters[4] = {recovered<V>(samples, anchor, factors[0]),
                                       recovered<V>(samples + V::kFloats, anchor, factors[1]),
                                       recovered<V>(samples + 2 * V::kFloats, anchor, factors[2]),
                                       recovered<V>(samples + 3 * V::kFloats, anchor, factors[3])};
  return V::clamp32(quarters);
}

// 200 / (code + 40). In single precision it equals the double quotient rounded to single for every
// code.
template <typename V>
typename V::Float factors_of(const uint8_t* codes) {
  return V::div(V::set_float(200.0f), V::add(V::load_bytes(codes), V::set_float(40.0f)));
}

// A row of 2 x 2 blocks; returns the first block that it did not recover. Interleaved chroma has V at
// even bytes; of planar chroma a step takes half a vector of each plane.
template <typename V, bool kPlanar>
int recover_blocks_x86(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                       const uint8_t* tone_curve) {
  using Float = typename V::Float;
  constexpr int kStep = V::kBytes / 2;
  const typename V::Table brightened(tone_curve);
  const Float y = V::set_float(anchor.y);
  const Float v = V::set_float(anchor.v);
  const Float u = V::set_float(anchor.u);
  const Float vu = V::set_alternating(anchor.v, anchor.u);
  int x = 0;
  for (; x + kStep <= blocks; x += kStep) {
    const Float low = factors_of<V>(codes + x);
    const Float high = factors_of<V>(codes + x + V::kFloats);
    const Float pairs[4] = {V::repeat_low(low), V::repeat_high(low), V::repeat_low(high),
                            V::repeat_high(high)};
    uint8_t* const top = row.luma_top + 2 * x;
    uint8_t* const bottom = row.luma_bottom + 2 * x;
    V::store(top, brightened[recovered_row<V>(top, y, pairs)]);
    V::store(bottom, brightened[recovered_row<V>(bottom, y, pairs)]);
    if constexpr (kPlanar) {
      const typename V::Int quarters[4] = {
          recovered<V>(row.v + x, v, low), recovered<V>(row.v + x + V::kFloats, v, high),
          recovered<V>(row.u + x, u, low), recovered<V>(row.u + x + V::kFloats, u, high)};
      V::store_halves(row.v + x, row.u + x, V::clamp32(quarters));
    } else {
      V::store(row.v + 2 * x, recovered_row<V>(row.v + 2 * x, vu, pairs));
    }
  }
  return x;
}

}  // namespace haze::recover
