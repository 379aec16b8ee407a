// A still picture through the building blocks: from an NV21 frame to the recovered frame.
#include <haze_preview.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <vector>

using Bytes = std::vector<unsigned char>;

// [pipeline]
void dehaze_still(Bytes& nv21, int width, int height, int level) {
  const int w = width / 2, h = height / 2;
  const size_t pixels = static_cast<size_t>(w) * static_cast<size_t>(h);
  const int slot = 0, radius = 7, guided_radius = 20;

  // Half-resolution colours, their darkest channel, and its minimum over 15 x 15 pixels.
  Bytes bgr(3 * pixels), darkest(pixels), dark(pixels);
  std::vector<int> histogram(256);
  xYCrCb2BGRPreview_NV21(nv21.data(), nv21.data() + 4 * pixels, bgr.data(), width, height);
  CalculateMinChannelPreview(bgr.data(), darkest.data(), w, h, slot);
  CalculateDarkChannelPreview(darkest.data(), dark.data(), histogram.data(), w, h, radius);

  // The colour of the haze, and how much of each pixel is not haze.
  unsigned char light[3];
  EstimateAPreview(dark.data(), bgr.data(), histogram.data(), light, w, h);
  std::vector<float> t(pixels), t_per_pixel(pixels);
  EstimateTPreview(bgr.data(), light, t.data(), t_per_pixel.data(), w, h, level);

  // The filtered map is blocky; the per-pixel one knows where the edges are.
  Bytes codes(pixels);
  GuidedFilterPreview(t.data(), t_per_pixel.data(), codes.data(), w, h, guided_radius);

  HazeRemoving3Preview_NV21(nv21.data(), codes.data(), light, width, height, 0);
}
// [pipeline]

// A grey checkerboard of 16 x 16 pixels in haze that grows from left to right.
Bytes hazy_board(int width, int height) {
  Bytes nv21(static_cast<size_t>(width * height * 3 / 2), 128);
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const double clear = ((x / 16 + y / 16) % 2 != 0) ? 180.0 : 20.0;
      const double t = 1.0 - 0.6 * x / width;
      nv21[static_cast<size_t>(y * width + x)] =
          static_cast<unsigned char>(clear * t + 220.0 * (1.0 - t));
    }
  return nv21;
}

// Mean difference between neighbouring fields, on the right half where the haze is dense.
double contrast(const Bytes& nv21, int width, int height) {
  double sum = 0;
  int count = 0;
  for (int y = 8; y < height; y += 16)
    for (int x = width / 2 + 8; x + 16 < width; x += 16, ++count) {
      const size_t i = static_cast<size_t>(y * width + x);
      sum += std::abs(nv21[i] - nv21[i + 16]);
    }
  return sum / count;
}

int main() {
  const int width = 640, height = 480, level = 9;
  Bytes frame = hazy_board(width, height);
  const double before = contrast(frame, width, height);
  dehaze_still(frame, width, height, level);
  const double after = contrast(frame, width, height);
  std::printf("contrast in dense haze: %.1f before, %.1f after\n", before, after);
  return after > 1.2 * before ? EXIT_SUCCESS : EXIT_FAILURE;
}
