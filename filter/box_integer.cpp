// Mean filters of 8-bit images by running sums: each output costs the same for every window size.
#include <stddef.h>
#include <stdint.h>
#include <string.h>

#include "core/image_size.h"
#include "filter/box_integer_kernels.h"
#include "filter/reciprocals_64.h"
#include "haze_preview.h"

namespace {

using haze::filter::kLeastCount;
using haze::filter::kReciprocals64;
using haze::filter::kWindow;
using haze::filter::PrefixRow;
using haze::filter::Reach;
using haze::filter::Reciprocals64;

#if HAZE_X86
// Means of the windows of `reach` by prefix sums, in vectors. In a function of its own for the sake
// of the stack: a row's working memory takes some 46 KiB.
template <typename Sum, typename Kernel>
__attribute__((noinline)) void average_by_prefixes(const uint8_t* src, uint8_t* dst, int width,
                                                   int height, Reach reach, Sum* scratch,
                                                   Kernel* mean_row) {
  PrefixRow prefix_row(width, reach);
  haze::filter::sweep_columns(src, width, height, reach, prefix_row.column_sums,
                              [&](int y, int rows) {
                                mean_row(prefix_row, rows);
                                memcpy(dst + static_cast<ptrdiff_t>(y) * width, prefix_row.means,
                                       static_cast<size_t>(width));
                              });
  for (int x = 0; x < width; ++x) scratch[x] = prefix_row.column_sums[x];
}
#endif

// Means of the windows of `reach`, with `divide` as mean_row takes it.
template <typename RowSum, typename Sum, typename Divide>
void average(const uint8_t* src, uint8_t* dst, int width, int height, Reach reach, Sum* scratch,
             Divide divide) {
#if HAZE_X86
  const auto kernel = haze::x86_kernel(haze::filter::mean_row_avx2, haze::filter::mean_row_avx512);
  if (kernel != nullptr && PrefixRow::fits(width, reach)) {
    average_by_prefixes(src, dst, width, height, reach, scratch, kernel);
    return;
  }
#endif
  haze::filter::sweep_columns(src, width, height, reach, scratch, [=](int y, int rows) {
    haze::filter::mean_row<RowSum>(scratch, dst + static_cast<ptrdiff_t>(y) * width, width, reach,
                                   rows, divide);
  });
}

// Function objects, not functions: a call for every pixel would cost more than the mean.
constexpr auto divide_64 = [](int32_t sum, int rows, int columns) {
  return Reciprocals64::divide(static_cast<uint32_t>(sum),
                               kReciprocals64.row(rows)[columns - kLeastCount]);
};

// Exact for sums below 2^24 and counts up to 2^16: both convert without rounding, and a quotient
// that is no integer stays at least 1 / count >= 2^-16 below the next one, which is a whole step of
// a float under 256.
constexpr auto divide_small = [](int32_t sum, int rows, int columns) {
  return static_cast<uint8_t>(static_cast<float>(sum) / static_cast<float>(rows * columns));
};

// Double precision holds every sum and count of an image exactly, and its step under 256 is far
// less than 1 / count. 32-bit ARM divides it in hardware, unlike 64-bit integers.
constexpr auto divide_large = [](double sum, int rows, int columns) {
  return static_cast<uint8_t>(sum / (static_cast<double>(rows) * columns));
};

// Largest radius whose window sum, (2 * 127 + 1)^2 * 255, stays below 2^24.
constexpr int kLargestSmallRadius = 127;

}  // namespace

void AverageFilterShort64_u8(unsigned char* src, unsigned char* dst, int width, int height,
                             int /*radius*/, short* scratch) {
  if (width < kWindow || height < kWindow) return;
  // Range: a column of 64 bytes sums to at most 16,320, which fits 16 bits.
  average<int32_t>(src, dst, width, height, {kWindow / 2, kWindow / 2 - 1}, scratch, divide_64);
}

void AverageFilter_u8(unsigned char* src, unsigned char* dst, int width, int height, int radius,
                      int* scratch) {
  if (!haze::holds_window(width, height, radius)) return;
  const Reach reach = {radius, radius};
  if (radius <= kLargestSmallRadius)
    average<int32_t>(src, dst, width, height, reach, scratch, divide_small);
  else
    average<double>(src, dst, width, height, reach, scratch, divide_large);
}
