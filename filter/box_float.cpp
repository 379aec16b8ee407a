// Mean filters of float planes by running sums.
#include "core/image_size.h"
#include "core/scratch.h"
#include "filter/box_float_kernels.h"
#include "haze_preview.h"

namespace {

using haze::filter::PlaneTerm;
using haze::filter::ProductTerm;

// dst = mean of `term` over the window clipped to the image. `sums` holds one row.
template <typename Term>
void mean_of(Term term, float* dst, int width, int height, int radius, float* sums) {
  const auto row = [=](int y) { return term.from(static_cast<ptrdiff_t>(y) * width); };
  haze::filter::start_columns(sums, term, width);
  for (int y = 1; y < radius; ++y) haze::filter::add_row(sums, row(y), width);
  for (int y = 0; y < height; ++y) {
    int rows = 2 * radius + 1;
    if (y <= radius) {
      haze::filter::add_row(sums, row(y + radius), width);
      rows = y + radius + 1;
    } else if (y < height - radius) {
      haze::filter::slide_rows(sums, row(y + radius), row(y - radius - 1), width);
    } else {
      haze::filter::subtract_row(sums, row(y - radius - 1), width);
      rows = height - y + radius;
    }
    haze::filter::mean_row_float(sums, dst + static_cast<ptrdiff_t>(y) * width, width, radius,
                                 static_cast<float>(rows));
  }
}

// A quantity and the plane that its mean goes to.
template <typename Term>
struct Mean {
  Term term;
  float* dst;
};

template <typename... Terms>
void means_of(int width, int height, int radius, Mean<Terms>... means) {
  if (!haze::holds_window(width, height, radius)) return;
  haze::Scratch<float> sums(static_cast<size_t>(width));
  if (!sums) return;
  (mean_of(means.term, means.dst, width, height, radius, sums.data()), ...);
}

}  // namespace

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
  means_of(width, height, radius, Mean<PlaneTerm>{{a}, meanA}, Mean<PlaneTerm>{{b}, meanB});
}

void AverageFilter_f_Out4Preview(float* a, float* b, float* meanA, float* meanB, float* meanAB,
                                 float* meanBB, int width, int height, int radius) {
  means_of(width, height, radius, Mean<PlaneTerm>{{a}, meanA}, Mean<PlaneTerm>{{b}, meanB},
           Mean<ProductTerm>{{a, b}, meanAB}, Mean<ProductTerm>{{b, b}, meanBB});
}
