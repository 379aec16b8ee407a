// Vector paths of the recoveries of NV21 and planar frames for x86-64, by vector type: arithmetic
// in place of tables.
#pragma once

#include <stdint.h>

#include "recover/block_row.h"
#include "recover/light_anchor.h"
#include "recover/recovered_x86.h"

namespace haze::recover {

// 200 / (code + 40). In single precision it equals the double quotient rounded to single for every
// code.
template <typename V>
typename V::Float factors_of(const uint8_t* codes) {
  return V::div(V::set_float(200.0f), V::add(V::load_bytes(codes), V::set_float(40.0f)));
}

// kBytes / 2 blocks from their factors. Interleaved chroma has V at even bytes.
template <typename V, typename How, bool kPlanar>
void recover_step(BlockRow row, int x, typename V::Float low, typename V::Float high,
                  LightAnchor anchor, const typename V::Table& brightened) {
  using Float = typename V::Float;
  const Float pairs[4] = {V::repeat_low(low), V::repeat_high(low), V::repeat_low(high),
                          V::repeat_high(high)};
  const Float y = V::set_float(anchor.y);
  uint8_t* const top = row.luma_top + 2 * x;
  uint8_t* const bottom = row.luma_bottom + 2 * x;
  V::store(top, brightened[recovered_row<V, How>(top, y, pairs)]);
  V::store(bottom, brightened[recovered_row<V, How>(bottom, y, pairs)]);
  if constexpr (kPlanar) {
    recover_two_planes<V, How>(row.v + x, V::set_float(anchor.v), row.u + x, V::set_float(anchor.u),
                               low, high);
  } else {
    V::store(row.v + 2 * x,
             recovered_row<V, How>(row.v + 2 * x, V::set_alternating(anchor.v, anchor.u), pairs));
  }
}

// A row of 2 x 2 blocks; returns the first block that it did not recover.
template <typename V, bool kPlanar>
int recover_blocks_x86(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                       const uint8_t* tone_curve) {
  const typename V::Table brightened(tone_curve);
  int x = 0;
  for (; x + V::kBytes / 2 <= blocks; x += V::kBytes / 2) {
    recover_step<V, ByFactor<V>, kPlanar>(row, x, factors_of<V>(codes + x),
                                          factors_of<V>(codes + x + V::kFloats), anchor,
                                          brightened);
  }
  return x;
}

// The same for NV21 from float transmissions, by division.
template <typename V>
int recover_by_division_x86(BlockRow row, const float* t, int blocks, LightAnchor anchor,
                            const uint8_t* tone_curve) {
  const typename V::Table brightened(tone_curve);
  int x = 0;
  for (; x + V::kBytes / 2 <= blocks; x += V::kBytes / 2) {
    recover_step<V, ByDivision<V>, false>(row, x, V::load_floats(t + x),
                                          V::load_floats(t + x + V::kFloats), anchor, brightened);
  }
  return x;
}

}  // namespace haze::recover
