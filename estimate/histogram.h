// Histograms of bytes.
#pragma once

#include <stddef.h>
#include <stdint.h>

namespace haze::estimate {

inline constexpr int kBins = 256;

// Counts of bytes, spread over four tables so that runs of one value do not wait for each other.
class ByteCounts {
 public:
  void add(const uint8_t* bytes, size_t count) {
    size_t i = 0;
    for (; i + 4 <= count; i += 4) {
      ++tables_[0][bytes[i]];
      ++tables_[1][bytes[i + 1]];
      ++tables_[2][bytes[i + 2]];
      ++tables_[3][bytes[i + 3]];
    }
    for (; i < count; ++i) ++tables_[0][bytes[i]];
  }

  void add_to(int* histogram) const {
    for (int bin = 0; bin < kBins; ++bin) {
      histogram[bin] +=
          static_cast<int>(tables_[0][bin] + tables_[1][bin] + tables_[2][bin] + tables_[3][bin]);
    }
  }

 private:
  uint32_t tables_[4][kBins] = {};
};

}  // namespace haze::estimate
