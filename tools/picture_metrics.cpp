#include "picture_metrics.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

#include "color_difference.h"

namespace dehaze {
namespace {

constexpr int kWindow = 11;
constexpr double kSigma = 1.5;
constexpr double kPeak = 255;

// Below it a colour is grey but for the rounding of the sRGB matrix.
constexpr double kLeastChroma = 0.1;

using Plane = std::vector<double>;

// Rows of windows that are worked on at a time: the planes of a large picture would fill the
// memory.
constexpr size_t kBandRows = 256;

// Of `rows` rows from `first_row` on.
Plane luma_of(const RgbPicture& picture, size_t first_row, size_t rows) {
  const size_t width = static_cast<size_t>(picture.width);
  Plane luma(width * rows);
  for (size_t i = 0; i < luma.size(); ++i) {
    const uint8_t* rgb = &picture.bytes[(first_row * width + i) * 3];
    luma[i] = 0.299 * rgb[0] + 0.587 * rgb[1] + 0.114 * rgb[2];
  }
  return luma;
}

double pixels_of(const RgbPicture& picture) {
  return static_cast<double>(picture.width) * picture.height;
}

std::array<double, kWindow> gaussian_window() {
  constexpr int kMiddle = kWindow / 2;
  std::array<double, kWindow> weights;
  double sum = 0;
  for (int i = 0; i < kWindow; ++i) {
    const double distance = i - kMiddle;
    weights[static_cast<size_t>(i)] = std::exp(-distance * distance / (2 * kSigma * kSigma));
    sum += weights[static_cast<size_t>(i)];
  }
  for (double& weight : weights) weight /= sum;
  return weights;
}

// Of a row (step 1) or a column (step: samples per row).
double weighted_sum(const double* samples, size_t step,
                    const std::array<double, kWindow>& weights) {
  double sum = 0;
  for (const double weight : weights) {
    sum += weight * *samples;
    samples += step;
  }
  return sum;
}

// Gaussian mean of every window that lies wholly in the plane: (width - 10) x (height - 10).
Plane window_means(const Plane& plane, size_t width, size_t height) {
  static const std::array<double, kWindow> kWeights = gaussian_window();
  const size_t columns = width - kWindow + 1;
  const size_t rows = height - kWindow + 1;
  Plane across(columns * height);
  for (size_t y = 0; y < height; ++y) {
    for (size_t x = 0; x < columns; ++x) {
      across[y * columns + x] = weighted_sum(&plane[y * width + x], 1, kWeights);
    }
  }
  Plane means(columns * rows);
  for (size_t i = 0; i < means.size(); ++i) means[i] = weighted_sum(&across[i], columns, kWeights);
  return means;
}

Plane product(const Plane& a, const Plane& b) {
  Plane result(a.size());
  for (size_t i = 0; i < a.size(); ++i) result[i] = a[i] * b[i];
  return result;
}

// Of every window of two bands of luma, in the order of the picture.
void add_ssim(const Plane& a, const Plane& b, size_t width, size_t height, double& sum) {
  constexpr double kC1 = (0.01 * kPeak) * (0.01 * kPeak);
  constexpr double kC2 = (0.03 * kPeak) * (0.03 * kPeak);
  const Plane mean_a = window_means(a, width, height);
  const Plane mean_b = window_means(b, width, height);
  const Plane mean_aa = window_means(product(a, a), width, height);
  const Plane mean_bb = window_means(product(b, b), width, height);
  const Plane mean_ab = window_means(product(a, b), width, height);
  for (size_t i = 0; i < mean_a.size(); ++i) {
    const double means = mean_a[i] * mean_b[i];
    const double squares = mean_a[i] * mean_a[i] + mean_b[i] * mean_b[i];
    const double covariance = mean_ab[i] - means;
    const double variances = mean_aa[i] + mean_bb[i] - squares;
    sum += (2 * means + kC1) * (2 * covariance + kC2) / ((squares + kC1) * (variances + kC2));
  }
}

}  // namespace

double psnr_rgb(const RgbPicture& a, const RgbPicture& b) {
  double squares = 0;
  for (size_t i = 0; i < a.bytes.size(); ++i) {
    const double difference = a.bytes[i] - b.bytes[i];
    squares += difference * difference;
  }
  if (squares == 0) return std::numeric_limits<double>::infinity();
  return 10 * std::log10(kPeak * kPeak * static_cast<double>(a.bytes.size()) / squares);
}

double ssim_luma(const RgbPicture& picture_a, const RgbPicture& picture_b) {
  const size_t width = static_cast<size_t>(picture_a.width);
  const size_t window_rows = static_cast<size_t>(picture_a.height) - kWindow + 1;
  double sum = 0;
  for (size_t row = 0; row < window_rows; row += kBandRows) {
    const size_t rows = std::min(kBandRows, window_rows - row) + kWindow - 1;
    add_ssim(luma_of(picture_a, row, rows), luma_of(picture_b, row, rows), width, rows, sum);
  }
  return sum / static_cast<double>((width - kWindow + 1) * window_rows);
}

double mean_ciede2000(const RgbPicture& a, const RgbPicture& b) {
  double sum = 0;
  for (size_t i = 0; i < a.bytes.size(); i += 3) {
    sum += ciede2000(lab_of_srgb(&a.bytes[i]), lab_of_srgb(&b.bytes[i]));
  }
  return sum / pixels_of(a);
}

double mean_hue_shift(const RgbPicture& reference, const RgbPicture& picture) {
  double sum = 0;
  double weights = 0;
  for (size_t i = 0; i < reference.bytes.size(); i += 3) {
    const Lab wanted = lab_of_srgb(&reference.bytes[i]);
    const double weight = chroma(wanted);
    if (weight < kLeastChroma) continue;
    sum += weight * hue_difference(wanted, lab_of_srgb(&picture.bytes[i]));
    weights += weight;
  }
  return weights > 0 ? sum / weights : 0;
}

double clipped_share(const RgbPicture& picture) {
  size_t clipped = 0;
  for (size_t i = 0; i < picture.bytes.size(); i += 3) {
    const auto begin = picture.bytes.begin() + static_cast<std::ptrdiff_t>(i);
    if (std::any_of(begin, begin + 3, [](uint8_t v) { return v == 0 || v == 255; })) ++clipped;
  }
  return static_cast<double>(clipped) / pixels_of(picture);
}

}  // namespace dehaze
