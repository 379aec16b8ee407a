// Window means on 8-bit images, written as means of windows cut off at the image border.
#pragma once

#include <cstdint>
#include <vector>

namespace haze::reference {

// The window of pixel (x, y) is rows y - before ... y + after and the same columns about x.
struct BoxWindow {
  int before;
  int after;
};

constexpr BoxWindow kWindow64 = {32, 31};

constexpr BoxWindow window_of_radius(int radius) { return {radius, radius}; }

// floor(sum / count) of every window, each summed up pixel by pixel: slow, beyond doubt.
void box_mean_by_windows(const uint8_t* src, uint8_t* dst, int width, int height, BoxWindow window);

// The same means by differences of prefix sums, for large images.
void box_mean(const uint8_t* src, uint8_t* dst, int width, int height, BoxWindow window);

// What the row of column sums holds when the filter is done: the sums over the last output row's
// window.
std::vector<int> box_column_sums_at_end(const uint8_t* src, int width, int height,
                                        BoxWindow window);

}  // namespace haze::reference
