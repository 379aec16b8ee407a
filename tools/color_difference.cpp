#include "color_difference.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace dehaze {
namespace {

constexpr double kPi = 3.14159265358979323846;

double degrees(double radians) { return radians * 180 / kPi; }
double radians(double degrees) { return degrees * kPi / 180; }

std::array<double, 256> make_linear_table() {
  std::array<double, 256> table;
  for (size_t i = 0; i < table.size(); ++i) {
    const double value = static_cast<double>(i) / 255;
    table[i] = value <= 0.04045 ? value / 12.92 : std::pow((value + 0.055) / 1.055, 2.4);
  }
  return table;
}

// The cube root of L*a*b*, with its straight part near black.
double lab_root(double ratio) {
  constexpr double kDelta = 6.0 / 29;
  return ratio > kDelta * kDelta * kDelta ? std::cbrt(ratio)
                                          : ratio / (3 * kDelta * kDelta) + 4.0 / 29;
}

// 0 ... 360 degrees, 0 for colours without a hue.
double hue(double a, double b) {
  if (a == 0 && b == 0) return 0;
  const double angle = degrees(std::atan2(b, a));
  return angle < 0 ? angle + 360 : angle;
}

double seventh_power_share(double chroma) {
  const double power = std::pow(chroma, 7);
  return std::sqrt(power / (power + std::pow(25.0, 7)));
}

}  // namespace

Lab lab_of_srgb(const uint8_t* rgb) {
  static const std::array<double, 256> kLinear = make_linear_table();
  const double r = kLinear[rgb[0]];
  const double g = kLinear[rgb[1]];
  const double b = kLinear[rgb[2]];
  // Rows of the sRGB matrix over their sums, so that white is (1, 1, 1).
  const double x = lab_root((0.4124564 * r + 0.3575761 * g + 0.1804375 * b) / 0.9504700);
  const double y = lab_root(0.2126729 * r + 0.7151522 * g + 0.0721750 * b);
  const double z = lab_root((0.0193339 * r + 0.1191920 * g + 0.9503041 * b) / 1.0888300);
  return {116 * y - 16, 500 * (x - y), 200 * (y - z)};
}

double chroma(const Lab& color) { return std::hypot(color.a, color.b); }

double hue_difference(const Lab& first, const Lab& second) {
  if (chroma(first) == 0 || chroma(second) == 0) return 0;
  const double angle = std::abs(hue(first.a, first.b) - hue(second.a, second.b));
  return std::min(angle, 360 - angle);
}

// Names as in the paper "The CIEDE2000 Color-Difference Formula: Implementation Notes,
// Supplementary Test Data, and Mathematical Observations" (2005).
double ciede2000(const Lab& first, const Lab& second) {
  const double g = 0.5 * (1 - seventh_power_share((chroma(first) + chroma(second)) / 2));
  const double a1 = (1 + g) * first.a;
  const double a2 = (1 + g) * second.a;
  const double c1 = std::hypot(a1, first.b);
  const double c2 = std::hypot(a2, second.b);
  const double h1 = hue(a1, first.b);
  const double h2 = hue(a2, second.b);

  const bool has_hue = c1 * c2 != 0;
  double hue_step = has_hue ? h2 - h1 : 0;
  if (hue_step > 180) hue_step -= 360;
  if (hue_step < -180) hue_step += 360;
  const double delta_l = second.l - first.l;
  const double delta_c = c2 - c1;
  const double delta_h = 2 * std::sqrt(c1 * c2) * std::sin(radians(hue_step / 2));

  const double mean_l = (first.l + second.l) / 2;
  const double mean_c = (c1 + c2) / 2;
  double mean_h = h1 + h2;
  if (has_hue) {
    if (std::abs(h1 - h2) > 180) mean_h += mean_h < 360 ? 360 : -360;
    mean_h /= 2;
  }
  const double t = 1 - 0.17 * std::cos(radians(mean_h - 30)) +
                   0.24 * std::cos(radians(2 * mean_h)) + 0.32 * std::cos(radians(3 * mean_h + 6)) -
                   0.20 * std::cos(radians(4 * mean_h - 63));
  const double turn = (mean_h - 275) / 25;
  const double rotation =
      -2 * seventh_power_share(mean_c) * std::sin(radians(60 * std::exp(-turn * turn)));
  const double light = (mean_l - 50) * (mean_l - 50);
  const double s_l = 1 + 0.015 * light / std::sqrt(20 + light);
  const double s_c = 1 + 0.045 * mean_c;
  const double s_h = 1 + 0.015 * mean_c * t;
  const double l = delta_l / s_l;
  const double c = delta_c / s_c;
  const double h = delta_h / s_h;
  return std::sqrt(l * l + c * c + h * h + rotation * c * h);
}

}  // namespace dehaze
