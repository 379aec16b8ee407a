// Reciprocal indices of the pixels of a row of 2 x 2 blocks, from a half-resolution map of float
// transmissions.
//
// The top-left pixel and the chroma take the block's own transmission t, the other pixels the mean
// of the blocks that they lie between:
//
//   t ------- right          anchor    t * 255
//   |    |    |              right     (t + right) * 128 - 1
//   | -- + -- |              below     (t + below) * 128 - 1
//   |    |    |              diagonal  (t + right + below + below_right) * 64 - 1
//   below --- below_right
//
// truncated towards zero. At the right and bottom borders the missing neighbours are the nearest
// ones that exist.
#pragma once

#include <stdint.h>

#include "core/numeric.h"

namespace haze::recover {

// Range: a transmission in [1/256, 1] gives 0 ... 255. Others are cut to that range, and what is
// not a number gives 0.
inline uint8_t reciprocal_index(float scaled) {
  const float least = scaled > 0.0f ? scaled : 0.0f;
  return static_cast<uint8_t>(static_cast<int>(least < 255.0f ? least : 255.0f));
}

inline uint8_t anchor_index(float t) { return reciprocal_index(t * 255.0f); }

// Indices of up to kBlocks neighbouring blocks.
struct BlockIndices {
  static constexpr int kBlocks = 128;

  uint8_t anchor[kBlocks];
  uint8_t right[kBlocks];
  uint8_t below[kBlocks];
  uint8_t diagonal[kBlocks];
};

// Blocks [begin, end) of one row of `blocks`; `next_row` is the row below, or `row` itself in the
// last row.
inline void fill_block_indices(const float* row, const float* next_row, int begin, int end,
                               int blocks, BlockIndices& indices) {
  for (int x = begin; x < end; ++x) {
    const int neighbour = min(x + 1, blocks - 1);
    const float t = row[x];
    const float right = row[neighbour];
    const float below = next_row[x];
    const float below_right = next_row[neighbour];
    const int i = x - begin;
    indices.anchor[i] = anchor_index(t);
    indices.right[i] = reciprocal_index(-1.0f + (t + right) * 128.0f);
    indices.below[i] = reciprocal_index(-1.0f + (t + below) * 128.0f);
    indices.diagonal[i] = reciprocal_index(-1.0f + (t + right + below + below_right) * 64.0f);
  }
}

}  // namespace haze::recover
