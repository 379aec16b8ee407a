// Vector paths of the recoveries of NV21 and planar frames for x86-64, by vector type: arithmetic
// in place of tables.
#pragma once

#include <stdint.h>

#include "core/numeric.h"
#include "recover/block_row.h"
#include "recover/light_anchor.h"
#include "recover/recovered_x86.h"

namespace haze::recover {

// A value of each block, for every pair of samples that lies in it.
template <typename V>
struct BlockValues {
  typename V::Float quarters[4];

  BlockValues(typename V::Float low, typename V::Float high) {
    V::split_pairs(low, high, low, high, quarters);
  }
};

// 200 / (code + 40) of kBytes / 2 codes. In single precision it equals the double quotient rounded
// to single for every code.
template <typename V>
BlockValues<V> factors_of(const uint8_t* codes) {
  typename V::Float low;
  typename V::Float high;
  V::load_half(codes, low, high);
  const typename V::Float offset = V::set_float(kByteOffset - 40.0f);
  const typename V::Float most = V::set_float(200.0f);
  return {V::div(most, V::sub(low, offset)), V::div(most, V::sub(high, offset))};
}

template <typename V>
BlockValues<V> transmissions_of(const float* t) {
  typename V::Float low = V::load_floats(t);
  typename V::Float high = V::load_floats(t + V::kFloats);
  V::order_half(low, high);
  return {low, high};
}

// kBytes / 2 blocks. Interleaved chroma has V at even bytes.
template <typename V, bool kPlanar, typename How>
void recover_step(BlockRow row, int x, How luma, How chroma, const BlockValues<V>& values,
                  const typename V::Table& brightened) {
  using Int = typename V::Int;
  uint8_t* const top = row.luma_top + 2 * x;
  uint8_t* const bottom = row.luma_bottom + 2 * x;
  const Int new_top = recovered<V>(V::load(top), luma, values.quarters);
  const Int new_bottom = recovered<V>(V::load(bottom), luma, values.quarters);
  if constexpr (kPlanar) {
    const Int vu = V::load_in_turn(row.v + x, row.u + x);
    V::store_in_turn(row.v + x, row.u + x, recovered<V>(vu, chroma, values.quarters));
  } else {
    V::store(row.v + 2 * x, recovered<V>(V::load(row.v + 2 * x), chroma, values.quarters));
  }
  V::store(top, brightened[new_top]);
  V::store(bottom, brightened[new_bottom]);
}

// A row of 2 x 2 blocks whose values `values_at(x)` gives; returns the first block that it did not
// recover. The values of a step are made during the step before it, which hides the latency of
// their division.
template <typename V, typename How, bool kPlanar, typename ValuesAt>
int recover_row_x86(BlockRow row, int blocks, LightAnchor anchor, const uint8_t* tone_curve,
                    ValuesAt values_at) {
  constexpr int kStep = V::kBytes / 2;
  if (blocks < kStep) return 0;
  const typename V::Table brightened(tone_curve);
  const How luma = {V::set_float(anchor.y)};
  const How chroma = {V::set_alternating(anchor.v, anchor.u)};
  const int last = blocks - kStep;
  BlockValues<V> values = values_at(0);
  int x = 0;
  for (; x <= last; x += kStep) {
    const BlockValues<V> next = values_at(min(x + kStep, last));
    recover_step<V, kPlanar>(row, x, luma, chroma, values, brightened);
    values = next;
  }
  return x;
}

template <typename V, bool kPlanar>
int recover_blocks_x86(BlockRow row, const uint8_t* codes, int blocks, LightAnchor anchor,
                       const uint8_t* tone_curve) {
  return recover_row_x86<V, ByFactor<V>, kPlanar>(row, blocks, anchor, tone_curve,
                                                  [=](int x) { return factors_of<V>(codes + x); });
}

// The same for NV21 from float transmissions, by division.
template <typename V>
int recover_by_division_x86(BlockRow row, const float* t, int blocks, LightAnchor anchor,
                            const uint8_t* tone_curve) {
  return recover_row_x86<V, ByDivision<V>, false>(
      row, blocks, anchor, tone_curve, [=](int x) { return transmissions_of<V>(t + x); });
}

}  // namespace haze::recover
