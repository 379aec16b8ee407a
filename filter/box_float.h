// The float box filters for callers inside the library, which have to know of memory that is short.
#pragma once

namespace haze::filter {

// AverageFilter_f_Out2Preview and AverageFilter_f_Out4Preview; false, with nothing written, for
// sizes that hold no window and if memory is short.
bool two_means(const float* a, const float* b, float* mean_a, float* mean_b, int width, int height,
               int radius);
bool four_means(const float* a, const float* b, float* mean_a, float* mean_b, float* mean_ab,
                float* mean_bb, int width, int height, int radius);

}  // namespace haze::filter
