// Walks that recover a planar frame from float transmissions.
#pragma once

#include <stdint.h>

#include "core/numeric.h"
#include "recover/block_indices.h"
#include "recover/planar_frame.h"
#include "recover/reciprocal_kernels.h"
#include "recover/reciprocal_recovery.h"

namespace haze::recover {

// Recovers every sample of blocks [begin, end) of one row of blocks, each with the index of its
// place.
template <typename Recovery>
void recover_blocks_of_row(const PlanarFrame& frame, int block_y, int begin, int end,
                           const Recovery& recovery) {
  const BlockRow row = frame.row(block_y);
  uint8_t* const top = row.luma_top;
  uint8_t* const bottom = row.luma_bottom;
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
      row.u[x] = recovery.u(row.u[x], indices.anchor[i]);
      row.v[x] = recovery.v(row.v[x], indices.anchor[i]);
    }
  }
}

// Recovers every sample of one row of blocks.
template <typename Recovery>
void recover_row(const PlanarFrame& frame, int block_y, const Recovery& recovery) {
  const int done = recover_every_pixel_vectors<Recovery::kInteger>(
      frame.row(block_y), frame.transmission_row(block_y), frame.next_transmission_row(block_y),
      frame.block_columns(), recovery.float_anchor());
  recover_blocks_of_row(frame, block_y, done, frame.block_columns(), recovery);
}

// Recovers every sample of the frame once.
template <typename Recovery>
void recover_every_pixel(const PlanarFrame& frame, const Recovery& recovery) {
  for (int y = 0; y < frame.block_rows(); ++y) recover_row(frame, y, recovery);
}

// The top-left luma of every block of one row.
inline void recover_anchors_of_row(const PlanarFrame& frame, int block_y,
                                   const IntegerRecovery& recovery) {
  uint8_t* const luma = frame.luma_row(2 * block_y);
  const float* const t = frame.transmission_row(block_y);
  const int columns = frame.block_columns();
  for (int x = recover_anchors_vectors(luma, t, columns, recovery.float_anchor()); x < columns; ++x)
    luma[2 * x] = recovery.luma(luma[2 * x], anchor_index(t[x]));
}

// The other three luma of all blocks of one row but the last, as means of the recovered top-left
// ones around them, and the chroma.
inline void fill_between_anchors(const PlanarFrame& frame, int block_y,
                                 const IntegerRecovery& recovery) {
  const BlockRow row = frame.row(block_y);
  const uint8_t* const next = frame.luma_row(2 * block_y + 2);
  const float* const t = frame.transmission_row(block_y);
  const int columns = frame.block_columns();
  for (int x = fill_between_anchors_vectors(row, next, t, columns, recovery.float_anchor());
       x < columns - 1; ++x) {
    const int anchor = row.luma_top[2 * x];
    const int right = row.luma_top[2 * x + 2];
    const int below = next[2 * x];
    const int below_right = next[2 * x + 2];
    row.luma_top[2 * x + 1] = static_cast<uint8_t>((anchor + right) >> 1);
    row.luma_bottom[2 * x] = static_cast<uint8_t>((anchor + below) >> 1);
    row.luma_bottom[2 * x + 1] = static_cast<uint8_t>((anchor + right + below + below_right) >> 2);
    const int index = anchor_index(t[x]);
    row.u[x] = recovery.u(row.u[x], index);
    row.v[x] = recovery.v(row.v[x], index);
  }
}

// Recovers the top-left luma of every block, and fills the other three pixels with the means of the
// recovered ones around them. The last column and row of blocks have no neighbours to take means of
// and are recovered pixel by pixel; their top-left pixels are thereby recovered twice.
inline void recover_anchors(const PlanarFrame& frame, const IntegerRecovery& recovery) {
  const int columns = frame.block_columns();
  const int rows = frame.block_rows();
  for (int y = 0; y < rows; ++y) recover_anchors_of_row(frame, y, recovery);
  for (int y = 0; y < rows - 1; ++y) {
    fill_between_anchors(frame, y, recovery);
    recover_blocks_of_row(frame, y, max(columns - 1, 0), columns, recovery);
  }
  if (rows > 0) recover_row(frame, rows - 1, recovery);
}

}  // namespace haze::recover
