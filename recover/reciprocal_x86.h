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
  const typename V::Float index = V::max(V::set_float(1.0f), V::whole_part(cut));
  return V::whole_part(V::div(V::set_float(65536.0f), index));
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

  // Puts two vectors of blocks in the order of V::split_pairs.
  static void order(BlockReciprocals& low, BlockReciprocals& high) {
    V::order_half(low.anchor, high.anchor);
    V::order_half(low.right, high.right);
    V::order_half(low.below, high.below);
    V::order_half(low.diagonal, high.diagonal);
  }
};

// Every sample of a row of 2 x 2 blocks of a planar frame; returns the first block that it did not
// recover. The last block has no neighbour to the right and is never among them.
template <typename V, bool kInteger>
int recover_every_pixel_x86(BlockRow row, const float* t, const float* next_t, int blocks,
                            FloatAnchor anchor, const uint8_t* tone_curve) {
  using How = std::conditional_t<kInteger, ByReciprocal<V>, ByFactorAnyAnchor<V>>;
  using Float = typename V::Float;
  const typename V::Table brightened(tone_curve);
  const How luma = {V::set_float(anchor.y)};
  const How chroma = {V::set_alternating(anchor.v, anchor.u)};
  int x = 0;
  for (; x + V::kBytes / 2 < blocks; x += V::kBytes / 2) {
    BlockReciprocals<V> low(t + x, next_t + x);
    BlockReciprocals<V> high(t + x + V::kFloats, next_t + x + V::kFloats);
    if constexpr (!kInteger) {
      low.scale();
      high.scale();
    }
    BlockReciprocals<V>::order(low, high);
    Float top_factors[4];
    Float bottom_factors[4];
    Float block_factors[4];
    V::split_pairs(low.anchor, high.anchor, low.right, high.right, top_factors);
    V::split_pairs(low.below, high.below, low.diagonal, high.diagonal, bottom_factors);
    V::split_pairs(low.anchor, high.anchor, low.anchor, high.anchor, block_factors);
    uint8_t* const top = row.luma_top + 2 * x;
    uint8_t* const bottom = row.luma_bottom + 2 * x;
    const typename V::Int vu = V::load_in_turn(row.v + x, row.u + x);
    V::store(top, brightened[recovered<V>(V::load(top), luma, top_factors)]);
    V::store(bottom, brightened[recovered<V>(V::load(bottom), luma, bottom_factors)]);
    V::store_in_turn(row.v + x, row.u + x, recovered<V>(vu, chroma, block_factors));
  }
  return x;
}

// Reciprocals of kBytes / 2 blocks, for every pair of samples that lies in a block.
template <typename V>
void block_reciprocals(const float* t, typename V::Float (&quarters)[4]) {
  const typename V::Float scale = V::set_float(255.0f);
  typename V::Float low = V::load_floats(t);
  typename V::Float high = V::load_floats(t + V::kFloats);
  V::order_half(low, high);
  low = reciprocals_of<V>(V::mul(low, scale));
  high = reciprocals_of<V>(V::mul(high, scale));
  V::split_pairs(low, high, low, high, quarters);
}

// The top-left luma of each block, the other luma left alone; returns the first block that it did
// not recover.
template <typename V>
int recover_anchors_x86(uint8_t* luma, const float* t, int blocks, float anchor,
                        const uint8_t* tone_curve) {
  using Int = typename V::Int;
  const typename V::Table brightened(tone_curve);
  const ByReciprocal<V> how = {V::set_float(anchor)};
  int x = 0;
  for (; x + V::kBytes / 2 <= blocks; x += V::kBytes / 2) {
    typename V::Float k[4];
    block_reciprocals<V>(t + x, k);
    const Int samples = V::load(luma + 2 * x);
    const Int bright = brightened[recovered<V>(samples, how, k)];
    V::store(luma + 2 * x, V::bit_or(V::bit_and(bright, V::set16(0x00FF)),
                                     V::bit_and(samples, V::set16(0xFF00))));
  }
  return x;
}

// The other three luma of each block as means of the recovered top-left ones around it, and the
// chroma; returns the first block that it did not finish, never past the last but one. `next` is
// the luma row below the blocks.
template <typename V>
int fill_between_anchors_x86(BlockRow row, const uint8_t* next, const float* t, int blocks,
                             FloatAnchor anchor) {
  using Int = typename V::Int;
  const Int even = V::set16(0x00FF);
  const ByReciprocal<V> chroma = {V::set_alternating(anchor.v, anchor.u)};
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
    typename V::Float k[4];
    block_reciprocals<V>(t + x, k);
    const Int vu = V::load_in_turn(row.v + x, row.u + x);
    V::store_in_turn(row.v + x, row.u + x, recovered<V>(vu, chroma, k));
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
  const ByReciprocal<V> how = {V::set_four(anchor.y, anchor.v, anchor.y, anchor.u)};
  const Int luma_bytes = V::set16(0x00FF);
  const Int chroma_bytes = V::set16(0xFF00);
  int x = 0;
  for (; x + V::kFloats < blocks; x += V::kFloats) {
    const BlockReciprocals<V> k(t + x, next_t + x);
    const Float top_factors[4] = {V::template split_group<0>(k.anchor, k.right),
                                  V::template split_group<1>(k.anchor, k.right),
                                  V::template split_group<2>(k.anchor, k.right),
                                  V::template split_group<3>(k.anchor, k.right)};
    const Float bottom_factors[4] = {V::template split_group<0>(k.below, k.diagonal),
                                     V::template split_group<1>(k.below, k.diagonal),
                                     V::template split_group<2>(k.below, k.diagonal),
                                     V::template split_group<3>(k.below, k.diagonal)};
    const ptrdiff_t offset = 4 * static_cast<ptrdiff_t>(x);
    const Int top = recovered<V>(V::load(src + offset), how, top_factors);
    const Int bottom = recovered<V>(V::load(src + row_bytes + offset), how, bottom_factors);
    const Int chroma = V::bit_and(top, chroma_bytes);
    V::store(dst + offset, V::bit_or(V::bit_and(brightened[top], luma_bytes), chroma));
    V::store(dst + row_bytes + offset,
             V::bit_or(V::bit_and(brightened[bottom], luma_bytes), chroma));
  }
  return x;
}

}  // namespace haze::recover
