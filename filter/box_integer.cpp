// Mean filters of 8-bit images by running sums: each output costs the same for every window size.
#include <stdint.h>

#include "core/image_size.h"
#include "filter/box_integer_kernels.h"
#include "filter/reciprocals_64.h"
#include "haze_preview.h"

namespace {

using haze::filter::kLeastCount;
using haze::filter::kReciprocals64;
using haze::filter::kWindow;
using haze::filter::mean_row;
using haze::filter::Reach;
using haze::filter::Reciprocals64;

void average_64(const uint8_t* src, uint8_t* dst, int width, int height, int16_t* scratch) {
  constexpr Reach kReach = {kWindow / 2, kWindow / 2 - 1};
  // Range: a column of 64 bytes sums to at most 16,320, which fits 16 bits.
  haze::filter::sweep_columns(src, width, height, kReach, scratch, [=](int y, int rows) {
    const uint32_t* reciprocals = kReciprocals64.row(rows);
    const uint32_t full = reciprocals[kWindow - kLeastCount];
    mean_row<uint32_t>(
        scratch, dst + static_cast<ptrdiff_t>(y) * width, width, kReach,
        [=](uint32_t sum, int columns) {
          return Reciprocals64::divide(sum, reciprocals[columns - kLeastCount]);
        },
        [=](uint32_t sum) { return Reciprocals64::divide(sum, full); });
  });
}

// `divide(sum, count)` is floor(sum / count).
template <typename RowSum, typename Divide>
void average_square(const uint8_t* src, uint8_t* dst, int width, int height, int radius,
                    int32_t* scratch, Divide divide) {
  const Reach reach = {radius, radius};
  haze::filter::sweep_columns(src, width, height, reach, scratch, [=](int y, int rows) {
    const RowSum row_count = static_cast<RowSum>(rows);
    const RowSum full = row_count * static_cast<RowSum>(2 * radius + 1);
    mean_row<RowSum>(
        scratch, dst + static_cast<ptrdiff_t>(y) * width, width, reach,
        [=](RowSum sum, int columns) {
          return divide(sum, row_count * static_cast<RowSum>(columns));
        },
        [=](RowSum sum) { return divide(sum, full); });
  });
}

// Exact for sums below 2^24 and counts up to 2^16: both convert without rounding, and a quotient
// that is no integer stays at least 1 / count >= 2^-16 below the next one, which is a whole step of
// a float under 256.
uint8_t divide_small(uint32_t sum, uint32_t count) {
  return static_cast<uint8_t>(static_cast<float>(sum) / static_cast<float>(count));
}

// Double precision holds every sum and count of an image exactly, and its step under 256 is far
// less than 1 / count. 32-bit ARM divides it in hardware, unlike 64-bit integers.
uint8_t divide_large(double sum, double count) { return static_cast<uint8_t>(sum / count); }

// Largest radius whose window sum, (2 * 127 + 1)^2 * 255, stays below 2^24.
constexpr int kLargestSmallRadius = 127;

}  // namespace

void AverageFilterShort64_u8(unsigned char* src, unsigned char* dst, int width, int height,
                             int /*radius*/, short* scratch) {
  if (width < kWindow || height < kWindow) return;
  average_64(src, dst, width, height, scratch);
}

void AverageFilter_u8(unsigned char* src, unsigned char* dst, int width, int height, int radius,
                      int* scratch) {
  if (!haze::holds_window(width, height, radius)) return;
  if (radius <= kLargestSmallRadius)
    average_square<uint32_t>(src, dst, width, height, radius, scratch, divide_small);
  else
    average_square<double>(src, dst, width, height, radius, scratch, divide_large);
}
