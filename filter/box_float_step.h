// How the column sums of the float box filters move on from one output row to the next.
#pragma once

#include <stddef.h>

namespace haze::filter {

enum class ColumnStep {
  kEnter,  // a row enters the window
  kLeave,  // a row leaves it
  kSlide,  // both; their difference is formed first
};

// A row of a plane, or of the product of two.
struct RowPointers {
  const float* first;
  const float* second;
};

}  // namespace haze::filter
