// Division by the pixel counts of a 64 x 64 window that the image border cuts, as one
// multiplication.
#pragma once

#include <stdint.h>

namespace haze::filter {

inline constexpr int kWindow = 64;
inline constexpr int kLeastCount = 32;  // rows or columns left of a window at the border

// ceil(2^32 / (rows * columns)) for every pair of counts in 32 ... 64.
//
// Exact: with m = ceil(2^32 / d) = (2^32 + e) / d, 0 <= e < d, the product is
// sum * m / 2^32 = sum / d + (sum / 2^32) * (e / d), and sum <= 255 * 4096 < 2^20 makes the error
// less than 2^-12 <= 1 / d, too little to reach the next integer.
class Reciprocals64 {
 public:
  constexpr Reciprocals64() : values_() {
    for (uint32_t rows = 0; rows < kCounts; ++rows)
      for (uint32_t columns = 0; columns < kCounts; ++columns)
        values_[rows][columns] = 0xFFFFFFFFu / ((rows + kLeastCount) * (columns + kLeastCount)) + 1;
  }

  // Reciprocals for one count of rows, by count of columns less 32.
  constexpr const uint32_t* row(int rows) const { return values_[rows - kLeastCount]; }

  static constexpr uint8_t divide(uint32_t sum, uint32_t reciprocal) {
    return static_cast<uint8_t>(static_cast<uint64_t>(sum) * reciprocal >> 32);
  }

 private:
  static constexpr uint32_t kCounts = kWindow - kLeastCount + 1;
  uint32_t values_[kCounts][kCounts];
};

inline constexpr Reciprocals64 kReciprocals64;

}  // namespace haze::filter
