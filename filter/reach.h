// How far windows reach.
#pragma once

#include "core/numeric.h"

namespace haze::filter {

// How far a window reaches from its centre: rows y - before ... y + after, columns likewise.
struct Reach {
  int before;
  int after;
};

// Pixels of a window centred on `position` that lie in 0 ... size - 1.
constexpr int window_count(int position, Reach reach, int size) {
  return min(position + reach.after, size - 1) - max(position - reach.before, 0) + 1;
}

}  // namespace haze::filter
