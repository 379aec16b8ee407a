// Mean filters of float planes by running sums.
#include "filter/box_float.h"

#include "core/image_size.h"
#include "core/scratch.h"
#include "filter/box_float_kernels.h"
#include "haze_preview.h"

namespace {

using haze::filter::PlaneTerm;
using haze::filter::ProductTerm;

// Rows whose horizontal sums go side by side, enough to hide the latency of an addition.
constexpr int kGroup = 4;

// Column sums of the output rows of `term`, one row at a time from the top.
template <typename Term>
class ColumnSums {
 public:
  // Starts above the first output row, with the sums in `sums` of the rows 0 ... radius - 1.
  ColumnSums(Term term, int width, int height, int radius, float* sums)
      : term_(term), width_(width), height_(height), radius_(radius), above_(sums) {
    haze::filter::start_columns(sums, term, width);
    for (int y = 1; y < radius; ++y) haze::filter::add_row(sums, sums, row(y), width);
  }

  // Writes the sums of the next output row; returns the number of rows in its window.
  int next(float* sums) {
    const int y = y_++;
    int rows = 2 * radius_ + 1;
    if (y <= radius_) {
      haze::filter::add_row(above_, sums, row(y + radius_), width_);
      rows = y + radius_ + 1;
    } else if (y < height_ - radius_) {
      haze::filter::slide_rows(above_, sums, row(y + radius_), row(y - radius_ - 1), width_);
    } else {
      haze::filter::subtract_row(above_, sums, row(y - radius_ - 1), width_);
      rows = height_ - y + radius_;
    }
    above_ = sums;
    return rows;
  }

 private:
  Term row(int y) const { return term_.from(static_cast<ptrdiff_t>(y) * width_); }

  Term term_;
  int width_;
  int height_;
  int radius_;
  const float* above_;
  int y_ = 0;
};

// The next kRows rows of output. `sums` holds as many rows, of which the last is the one above.
template <int kRows, typename Term>
void mean_group(ColumnSums<Term>& columns, float* dst, int width, int radius, float* sums) {
  haze::filter::RowGroup<kRows> group;
  for (int k = 0; k < kRows; ++k) {
    float* const row_sums = sums + static_cast<ptrdiff_t>(k) * width;
    group.rows[k] = static_cast<float>(columns.next(row_sums));
    group.sums[k] = row_sums;
    group.dst[k] = dst + static_cast<ptrdiff_t>(k) * width;
  }
  haze::filter::mean_rows(group, width, radius);
}

// dst = mean of `term` over the window clipped to the image. `sums` holds kGroup rows.
template <typename Term>
void mean_of(Term term, float* dst, int width, int height, int radius, float* sums) {
  ColumnSums<Term> columns(term, width, height, radius,
                           sums + static_cast<ptrdiff_t>(kGroup - 1) * width);
  int y = 0;
  for (; y + kGroup <= height; y += kGroup)
    mean_group<kGroup>(columns, dst + static_cast<ptrdiff_t>(y) * width, width, radius, sums);
  for (; y < height; ++y)
    mean_group<1>(columns, dst + static_cast<ptrdiff_t>(y) * width, width, radius, sums);
}

// A quantity and the plane that its mean goes to.
template <typename Term>
struct Mean {
  Term term;
  float* dst;
};

template <typename... Terms>
bool means_of(int width, int height, int radius, Mean<Terms>... means) {
  if (!haze::holds_window(width, height, radius)) return false;
  haze::Scratch<float> sums(kGroup * static_cast<size_t>(width));
  if (!sums) return false;
  (mean_of(means.term, means.dst, width, height, radius, sums.data()), ...);
  return true;
}

}  // namespace

namespace haze::filter {

bool two_means(const float* a, const float* b, float* mean_a, float* mean_b, int width, int height,
               int radius) {
  return means_of(width, height, radius, Mean<PlaneTerm>{{a}, mean_a},
                  Mean<PlaneTerm>{{b}, mean_b});
}

bool four_means(const float* a, const float* b, float* mean_a, float* mean_b, float* mean_ab,
                float* mean_bb, int width, int height, int radius) {
  return means_of(width, height, radius, Mean<PlaneTerm>{{a}, mean_a}, Mean<PlaneTerm>{{b}, mean_b},
                  Mean<ProductTerm>{{a, b}, mean_ab}, Mean<ProductTerm>{{b, b}, mean_bb});
}

}  // namespace haze::filter

void AverageFilter_fPreview(float* src, float* dst, int width, int height, int radius) {
  means_of(width, height, radius, Mean<PlaneTerm>{{src}, dst});
}

void AverageFilter_f_2Preview(float* src, float* dst, int width, int height, int radius) {
  means_of(width, height, radius, Mean<ProductTerm>{{src, src}, dst});
}

void AverageFilter_fPreview(float* a, float* b, float* dst, int width, int height, int radius) {
  means_of(width, height, radius, Mean<ProductTerm>{{a, b}, dst});
}

void AverageFilter_f_Out2Preview(float* a, float* b, float* meanA, float* meanB, int width,
                                 int height, int radius) {
  haze::filter::two_means(a, b, meanA, meanB, width, height, radius);
}

void AverageFilter_f_Out4Preview(float* a, float* b, float* meanA, float* meanB, float* meanAB,
                                 float* meanBB, int width, int height, int radius) {
  haze::filter::four_means(a, b, meanA, meanB, meanAB, meanBB, width, height, radius);
}
