// How close one picture is to another.
#pragma once

#include <cstdint>
#include <vector>

namespace dehaze {

struct RgbPicture {
  int width = 0;
  int height = 0;
  std::vector<uint8_t> bytes;  // R, G, B; packed rows
};

// Peak signal-to-noise ratio over all samples of all three channels, in dB; infinity if equal.
double psnr_rgb(const RgbPicture& a, const RgbPicture& b);

// Mean structural similarity of full-range BT.601 luma as in the paper of 2004: 11 x 11 Gaussian
// window with a standard deviation of 1.5, K1 = 0.01, K2 = 0.03, all windows that lie wholly in the
// picture. Pictures have at least 11 x 11 pixels.
double ssim_luma(const RgbPicture& a, const RgbPicture& b);

// Mean CIEDE2000 colour difference over all pixels.
double mean_ciede2000(const RgbPicture& a, const RgbPicture& b);

// Mean angle in degrees between the L*a*b* hues of `picture` and `reference`, each pixel weighted
// by the reference's chroma, so that greys, whose hue is chance, do not count. 0 if all of it is
// grey.
double mean_hue_shift(const RgbPicture& reference, const RgbPicture& picture);

// Share of the pixels, 0 ... 1, with a channel at 0 or 255.
double clipped_share(const RgbPicture& picture);

}  // namespace dehaze
