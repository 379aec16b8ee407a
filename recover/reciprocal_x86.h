// Vector paths of the recovery through reciprocals for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

#include <type_traits>

#include "recover/block_row.h"
#include "recover/light_anchor.h"
#include "recover/recovered_x86.h"

namespace haze::recover {

// 65536 / index, truncated, of the index that `scaled` truncates to within 0 ... 255, which is 0
// for what is not a number.
//
// Exact: a quotient q = 65536 / n that is no integer is at least 1 / n below the next one, which is
// more than its rounding error of at most q / 2^24. Index 0 has the reciprocal of 1.
template <typename V>
typename V::Float reciprocals_of(typename V::Float scaled) {
  const typename V::Float cut = V::min(V::set_float(255.0f), V::max(scaled, V::set_float(0.0f)));
  const typename V::Float index = V::to_float(V::truncate(cut));
  return V::to_float(
      V::truncate(V::div(V::set_float(65536.0f), V::max(V::set_float(1.0f), index))));
}

// Reciprocals of one vector of blocks for each place in a block, see block_indices.h.
template <typename V>
struct BlockReciprocals {
  using Float = typename V::Float;
  Float anchor;
  Float right;
  Float below;
  Float diagonal;

  BlockReciprocals(const float* row, const float* next_row) {
    const Float t = V::load_floats(row);
    const Float t_right = V::load_floats(row + 1);
    const Float t_below = V::load_floats(next_row);
    const Float t_below_right = V::load_floats(next_row + 1);
    const Float less_one = V::set_float(-1.0f);
    anchor = reciprocals_of<V>(V::mul(t, V::set_float(255.0f)));
    right = reciprocals_of<V>(V::add(less_one, V::mul(V::add(t, t_right), V::set_float(128.0f))));
    below = reciprocals_of<V>(V::add(less_one, V::mul(V::add(t, t_below), V::set_float(128.0f))));
    const Float sum = V::add(V::add(V::add(t, t_right), t_below), t_below_right);
    diagonal = reciprocals_of<V>(V::add(less_one, V::mul(sum, V::set_float(64.0f))));
  }

  // As factors of single precision: k / 2^8, exactly.
  void scale() {
    const Float unit = V::set_float(0.00390625f);
    anchor = V::mul(anchor, unit);
    right = V::mul(right, unit);
    below = V::mul(below, unit);
    diagonal = V::mul(diagonal, unit);
  }
};

// Every sample of a row of 2 x 2 blocks of a planar frame; returns the first block that it did not
// recover. The last block has no neighbour to the right and is never among them.
template <typename V, bool kInteger>
int recover_every_pixel_x86(BlockRow row, const float* t, const float* next_t, int blocks,
                            FloatAnchor anchor, const uint8_t* tone_curve) {
  using How = std::conditional_t<kInteger, ByReciprocal<V>, ByFactor<V>>;
  using Float = typename V::Float;
  const typename V::Table brightened(tone_curve);
  const Float y = V::set_float(anchor.y);
  int x = 0;
  for (; x + V::kBytes / 2 < blocks; x += V::kBytes / 2) {
    BlockReciprocals<V> low(t + x, next_t + x);
    BlockReciprocals<V> high(t + x + V::kFloats, next_t + x + V::kFloats);
    if constexpr (!kInteger) {
      low.scale();
      high.scale();
    }
    const Float top_factors[4] = {
        V::interleave_low(low.anchor, low.right), V::interleave_high(low.anchor, low.right),
        V::interleave_low(high.anchor, high.right), V::interleave_high(high.anchor, high.right)};
    const Float bottom_factors[4] = {V::interleave_low(low.below, low.diagonal),
                                     V::interleave_high(low.below, low.diagonal),
                                     V::interleave_low(high.below, high.diagonal),
                                     V::interleave_high(high.below, high.diagonal)};
    uint8_t* const top = row.luma_top + 2 * x;
    uint8_t* const bottom = row.luma_bottom + 2 * x;
    V::store(top, brightened[recovered_row<V, How>(top, y, top_factors)]);
    V::store(bottom, brightened[recovered_row<V, How>(bottom, y, bottom_factors)]);
    recover_two_planes<V, How>(row.v + x, V::set_float(anchor.v), row.u + x, V::set_float(anchor.u),
                               low.anchor, high.anchor);
  }
  return x;
}

// The top-left luma of each block, the other luma left alone; returns the first block that it did
// not recover.
template <typename V>
int recover_anchors_x86(uint8_t* luma, const float* t, int blocks, float anchor,
                        const uint8_t* tone_curve) {
  using Float = typename V::Float;
  using Int = typename V::Int;
  const typename V::Table brightened(tone_curve);
  const Float scale = V::set_float(255.0f);
  int x = 0;
  for (; x + V::kBytes / 2 <= blocks; x += V::kBytes / 2) {
    const Float low = reciprocals_of<V>(V::mul(V::load_floats(t + x), scale));
    const Float high = reciprocals_of<V>(V::mul(V::load_floats(t + x + V::kFloats), scale));
    const Float pairs[4] = {V::repeat_low(low), V::repeat_high(low), V::repeat_low(high),
                            V::repeat_high(high)};
    uint8_t* const samples = luma + 2 * x;
    const Int recovered =
        brightened[recovered_row<V, ByReciprocal<V>>(samples, V::set_float(anchor), pairs)];
    V::store(samples, V::bit_or(V::bit_and(recovered, V::set16(0x00FF)),
                                V::bit_and(V::load(samples), V::set16(0xFF00))));
  }
  return x;
}

// The other three luma of each block as means of the recovered top-left ones around it, and the
// chroma; returns the first block that it did not finish, never past the last but one. `next` is
// the luma row below the blocks.
template <typename V>
int fill_between_anchors_x86(BlockRow row, const uint8_t* next, const float* t, int blocks,
                             FloatAnchor anchor) {
  using Float = typename V::Float;
  using Int = typename V::Int;
  const Int even = V::set16(0x00FF);
  const Float scale = V::set_float(255.0f);
  int x = 0;
  // The neighbours of a step reach one luma pair beyond it.
  for (; x + V::kBytes / 2 < blocks; x += V::kBytes / 2) {
    const Int here = V::bit_and(V::load(row.luma_top + 2 * x), even);
    const Int right = V::bit_and(V::load(row.luma_top + 2 * x + 2), even);
    const Int below = V::bit_and(V::load(next + 2 * x), even);
    const Int below_right = V::bit_and(V::load(next + 2 * x + 2), even);
    const Int top_mean = V::template shift_right16<1>(V::add16(here, right));
    const Int left_mean = V::template shift_right16<1>(V::add16(here, below));
    const Int mean =
        V::template shift_right16<2>(V::add16(V::add16(here, right), V::add16(below, below_right)));
    V::store(row.luma_top + 2 * x, V::bit_or(here, V::template shift_left16<8>(top_mean)));
    V::store(row.luma_bottom + 2 * x, V::bit_or(left_mean, V::template shift_left16<8>(mean)));
    recover_two_planes<V, ByReciprocal<V>>(
        row.v + x, V::set_float(anchor.v), row.u + x, V::set_float(anchor.u),
        reciprocals_of<V>(V::mul(V::load_floats(t + x), scale)),
        reciprocals_of<V>(V::mul(V::load_floats(t + x + V::kFloats), scale)));
  }
  return x;
}

// Two rows of a packed frame (Y0, Cr, Y1, Cb) into another one, as recover_row_pair in
// packed_recovery.cpp; returns the first block that it did not recover, never past the last but
// one.
template <typename V>
int recover_packed_rows_x86(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes, const float* t,
                            const float* next_t, int blocks, FloatAnchor anchor,
                            const uint8_t* tone_curve) {
  using Float = typename V::Float;
  using Int = typename V::Int;
  const typename V::Table brightened(tone_curve);
  const Float anchors = V::set_four(anchor.y, anchor.v, anchor.y, anchor.u);
  const Int luma_bytes = V::set16(0x00FF);
  const Int chroma_bytes = V::set16(0xFF00);
  int x = 0;
  for (; x + V::kFloats < blocks; x += V::kFloats) {
    const BlockReciprocals<V> k(t + x, next_t + x);
    Float top_factors[4];
    Float bottom_factors[4];
    for (int quarter = 0; quarter < 4; ++quarter) {
      top_factors[quarter] = V::spread_quarter(k.anchor, k.right, quarter);
      bottom_factors[quarter] = V::spread_quarter(k.below, k.diagonal, quarter);
    }
    const ptrdiff_t offset = 4 * static_cast<ptrdiff_t>(x);
    const Int top = recovered_row<V, ByReciprocal<V>>(src + offset, anchors, top_factors);
    const Int bottom =
        recovered_row<V, ByReciprocal<V>>(src + row_bytes + offset, anchors, bottom_factors);
    const Int chroma = V::bit_and(top, chroma_bytes);
    V::store(dst + offset, V::bit_or(V::bit_and(brightened[top], luma_bytes), chroma));
    V::store(dst + row_bytes + offset,
             V::bit_or(V::bit_and(brightened[bottom], luma_bytes), chroma));
  }
  return x;
}

}  // namespace haze::recover
