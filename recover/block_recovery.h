// Walks that recover a planar frame from float transmissions.
#pragma once

#include <stdint.h>

#include "core/numeric.h"
#include "recover/block_indices.h"
#include "recover/planar_frame.h"

namespace haze::recover {

// Recovers every sample of blocks [begin, end) of one row of blocks, each with the index of its
// place.
template <typename Recovery>
void recover_blocks_of_row(const PlanarFrame& frame, int block_y, int begin, int end,
                           const Recovery& recovery) {
  uint8_t* const top = frame.luma_row(2 * block_y);
  uint8_t* const bottom = frame.luma_row(2 * block_y + 1);
  uint8_t* const u = frame.u_row(block_y);
  uint8_t* const v = frame.v_row(block_y);
  BlockIndices indices;
  for (int first = begin; first < end; first += BlockIndices::kBlocks) {
    const int last = min(first + BlockIndices::kBlocks, end);
    fill_block_indices(frame.transmission_row(block_y), frame.next_transmission_row(block_y), first,
                       last, frame.block_columns(), indices);
    for (int x = first; x < last; ++x) {
      const int i = x - first;
      top[2 * x] = recovery.luma(top[2 * x], indices.anchor[i]);
      top[2 * x + 1] = recovery.luma(top[2 * x + 1], indices.right[i]);
      bottom[2 * x] = recovery.luma(bottom[2 * x], indices.below[i]);
      bottom[2 * x + 1] = recovery.luma(bottom[2 * x + 1], indices.diagonal[i]);
      u[x] = recovery.u(u[x], indices.anchor[i]);
      v[x] = recovery.v(v[x], indices.anchor[i]);
    }
  }
}

// Recovers every sample of the frame once.
template <typename Recovery>
void recover_every_pixel(const PlanarFrame& frame, const Recovery& recovery) {
  for (int y = 0; y < frame.block_rows(); ++y)
    recover_blocks_of_row(frame, y, 0, frame.block_columns(), recovery);
}

// Recovers the top-left luma of every block, and fills the other three pixels with the means of the
// recovered ones around them. The last column and row of blocks have no neighbours to take means of
// and are recovered pixel by pixel; their top-left pixels are thereby recovered twice.
template <typename Recovery>
void recover_anchors(const PlanarFrame& frame, const Recovery& recovery) {
  const int columns = frame.block_columns();
  const int rows = frame.block_rows();
  for (int y = 0; y < rows; ++y) {
    uint8_t* const luma = frame.luma_row(2 * y);
    const float* const t = frame.transmission_row(y);
    for (int x = 0; x < columns; ++x) luma[2 * x] = recovery.luma(luma[2 * x], anchor_index(t[x]));
  }
  for (int y = 0; y < rows - 1; ++y) {
    uint8_t* const top = frame.luma_row(2 * y);
    uint8_t* const bottom = frame.luma_row(2 * y + 1);
    const uint8_t* const next = frame.luma_row(2 * y + 2);
    uint8_t* const u = frame.u_row(y);
    uint8_t* const v = frame.v_row(y);
    const float* const t = frame.transmission_row(y);
    for (int x = 0; x < columns - 1; ++x) {
      const int anchor = top[2 * x];
      const int right = top[2 * x + 2];
      const int below = next[2 * x];
      const int below_right = next[2 * x + 2];
      top[2 * x + 1] = static_cast<uint8_t>((anchor + right) >> 1);
      bottom[2 * x] = static_cast<uint8_t>((anchor + below) >> 1);
      bottom[2 * x + 1] = static_cast<uint8_t>((anchor + right + below + below_right) >> 2);
      const int index = anchor_index(t[x]);
      u[x] = recovery.u(u[x], index);
      v[x] = recovery.v(v[x], index);
    }
    recover_blocks_of_row(frame, y, max(columns - 1, 0), columns, recovery);
  }
  if (rows > 0) recover_blocks_of_row(frame, rows - 1, 0, columns, recovery);
}

}  // namespace haze::recover
