// Recovery of packed frames of two bytes a pixel, Y0 Cr Y1 Cb, into another buffer.
#include <stddef.h>

#include "core/image_size.h"
#include "core/numeric.h"
#include "haze_preview.h"
#include "recover/block_indices.h"
#include "recover/reciprocal_kernels.h"
#include "recover/reciprocal_recovery.h"

namespace {

using haze::recover::BlockIndices;
using haze::recover::IntegerRecovery;
using haze::recover::recover_packed_rows_vectors;

// Blocks [begin, end) of two rows. Chroma counts as subsampled vertically: the upper row's is used
// for both, the lower row's is not read.
void recover_row_pair(const uint8_t* src, uint8_t* dst, ptrdiff_t row_bytes, int begin, int end,
                      const BlockIndices& indices, const IntegerRecovery& recovery) {
  for (int x = begin; x < end; ++x) {
    const int i = x - begin;
    const uint8_t* const top = src + 4 * static_cast<ptrdiff_t>(x);
    const uint8_t* const bottom = top + row_bytes;
    uint8_t* const to_top = dst + 4 * static_cast<ptrdiff_t>(x);
    uint8_t* const to_bottom = to_top + row_bytes;
    to_top[0] = recovery.luma(top[0], indices.anchor[i]);
    to_top[2] = recovery.luma(top[2], indices.right[i]);
    to_bottom[0] = recovery.luma(bottom[0], indices.below[i]);
    to_bottom[2] = recovery.luma(bottom[2], indices.diagonal[i]);
    to_top[1] = to_bottom[1] = recovery.v(top[1], indices.anchor[i]);
    to_top[3] = to_bottom[3] = recovery.u(top[3], indices.anchor[i]);
  }
}

}  // namespace

void HazeRemovingPreview(unsigned char* src, float* t, unsigned char* A, unsigned char* dst, int w,
                         int h) {
  if (!haze::has_blocks(w, h)) return;
  const int columns = w / 2;
  const int rows = h / 2;
  const ptrdiff_t row_bytes = 2 * static_cast<ptrdiff_t>(w);
  const IntegerRecovery recovery = {haze::recover::light_anchor(A)};
  BlockIndices indices;
  for (int y = 0; y < rows; ++y) {
    const float* const row = t + static_cast<ptrdiff_t>(y) * columns;
    const float* const next_row = y + 1 < rows ? row + columns : row;
    const ptrdiff_t offset = 2 * y * row_bytes;
    const int done = recover_packed_rows_vectors(src + offset, dst + offset, row_bytes, row,
                                                 next_row, columns, recovery.float_anchor());
    for (int begin = done; begin < columns; begin += BlockIndices::kBlocks) {
      const int end = haze::min(begin + BlockIndices::kBlocks, columns);
      haze::recover::fill_block_indices(row, next_row, begin, end, columns, indices);
      recover_row_pair(src + offset, dst + offset, row_bytes, begin, end, indices, recovery);
    }
  }
}
