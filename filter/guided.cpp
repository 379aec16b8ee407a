// Guided filter on float planes, after the guided-filter paper of 2010, with transmission codes as
// output.
#include "core/image_size.h"
#include "core/scratch.h"
#include "filter/box_float.h"
#include "filter/guided_kernels.h"
#include "haze_preview.h"

void GuidedFilterPreview(float* p, float* I, unsigned char* out, int w, int h, int r) {
  if (!haze::holds_window(w, h, r)) return;
  const size_t count = haze::pixel_count(w, h);
  haze::Scratch<float> planes(4 * count);
  if (!planes) return;
  float* const mean_guide = planes.data();
  float* const mean_plane = mean_guide + count;
  float* const products = mean_plane + count;
  float* const squares = products + count;
  if (!haze::filter::four_means(I, p, mean_guide, mean_plane, products, squares, w, h, r)) return;
  haze::filter::fit_model(mean_guide, mean_plane, products, squares, count);
  float* const slopes = products;
  float* const offsets = squares;
  float* const mean_slopes = mean_guide;
  float* const mean_offsets = mean_plane;
  if (!haze::filter::two_means(slopes, offsets, mean_slopes, mean_offsets, w, h, r)) return;
  haze::filter::refined_codes(I, mean_slopes, mean_offsets, out, count);
}
