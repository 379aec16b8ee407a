// Window means on planes of floats by running sums. The order of additions is part of the
// definition: the sums are carried from row to row and from pixel to pixel, so their rounding
// errors add up.
#pragma once

#include <vector>

namespace haze::reference {

enum class Averaged { kFirst, kSecond, kProduct, kSecondSquared };

// Mean of the given quantity of the planes a and b over the window of 2 * radius + 1 rows and
// columns, cut off at the border. Needs radius >= 1 and at least 2 * radius + 1 rows and columns.
std::vector<float> box_mean_float(const float* a, const float* b, Averaged quantity, int width,
                                  int height, int radius);

// The mean that the running sums approximate, in double precision from every window afresh.
std::vector<double> box_mean_by_windows(const float* a, const float* b, Averaged quantity,
                                        int width, int height, int radius);

}  // namespace haze::reference
