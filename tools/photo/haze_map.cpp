#include "photo/haze_map.h"

#include <algorithm>
#include <cmath>

#include "haze_preview.h"

namespace dehaze {
namespace {

constexpr int kLongestSmallSide = 512;
constexpr int kShortestSmallSide = 8;

// Of the dark channel that the light is looked for in, as a part of the longer side. A white boat
// or parasol has to be smaller than the window to be passed over; with more than 3 % the window
// covers the haze between roofs seen from above as well.
constexpr int kLightWindowPart = 40;
// Steps of the dark channel in its histogram. The library averages over one bin; with single values
// a sky with a gradient would give the colour of its brightest corner.
constexpr int kDarkStep = 4;
// Thick haze is far away, and the ground gets farther from row to row of the picture: at its lower
// edge the dark channel counts this much less. Snow in front is brighter than most haze.
constexpr double kBottomLoss = 0.4;

constexpr int kGuidedWindowPart = 20;
constexpr float kGuidedRegularization = 1e-3F;

// Level 3 makes the float transmission 1 - 0.3 * share, which is above the library's floor of 0.4
// for every share up to 2: so the share comes back exactly, and the floor is ours to choose.
constexpr int kProbeLevel = 3;
constexpr float kProbeStrength = 0.3F;

// No recovered channel should leave this range. Not 0 ... 255, because the share is found for the
// first pixel of a block and used for all four.
constexpr float kDarkestResult = 6;
constexpr float kBrightestResult = 250;

// Of transmission_for_tint, in steps of U and V.
constexpr float kLeastTint = 0.5F;
constexpr float kOppositeTint = 12;
constexpr float kOppositeGain = 4;

int longer_side(const BgrImage& image) { return std::max(image.width, image.height); }
int shorter_side(const BgrImage& image) { return std::min(image.width, image.height); }

// As a part of the longer side; at least 1, and the window fits into the image.
int window_radius(int width, int height, int part) {
  const int largest = (std::min(width, height) - 1) / 2;
  return std::max(1, std::min(std::max(width, height) / part, largest));
}

// How much a pixel looks like thick haze, by its dark channel and its height: `depth` goes from 0
// to 1 down the picture.
uint8_t haze_score(int dark, double depth) {
  const int score = static_cast<int>(dark * (1 - kBottomLoss * depth));
  return static_cast<uint8_t>(score / kDarkStep * kDarkStep);
}

// Means of 2 x 2 pixels, rounded; the last column and row are repeated where there is no second
// one.
BgrImage halved(const BgrImage& image) {
  BgrImage half((image.width + 1) / 2, (image.height + 1) / 2);
  uint8_t* dst = half.bytes.data();
  for (int y = 0; y < half.height; ++y) {
    const ptrdiff_t row_bytes = static_cast<ptrdiff_t>(image.width) * 3;
    const uint8_t* upper = image.bytes.data() + 2 * y * row_bytes;
    const uint8_t* lower = 2 * y + 1 < image.height ? upper + row_bytes : upper;
    for (int x = 0; x < half.width; ++x) {
      const int next = 2 * x + 1 < image.width ? 3 : 0;
      for (int c = 0; c < 3; ++c) {
        const int sum = upper[c] + upper[c + next] + lower[c] + lower[c + next];
        *dst++ = static_cast<uint8_t>((sum + 2) / 4);
      }
      upper += 6;
      lower += 6;
    }
  }
  return half;
}

// Shares of haze by the dark-channel prior: `patch` over windows of 15 x 15 pixels, `pixel` of each
// pixel alone. The true share is not above that of the pixel, or a channel of J would be negative.
struct DarkShares {
  Plane patch;
  Plane pixel;
};

void transmission_to_share(Plane& plane) {
  for (float& value : plane.values) value = (1 - value) / kProbeStrength;
}

DarkShares dark_shares(BgrImage& image, Light light) {
  DarkShares shares = {Plane(image.width, image.height), Plane(image.width, image.height)};
  EstimateTPreview(image.bytes.data(), light.data(), shares.patch.values.data(),
                   shares.pixel.values.data(), image.width, image.height, kProbeLevel);
  transmission_to_share(shares.patch);
  transmission_to_share(shares.pixel);
  return shares;
}

// Composed of the float box filters: the codes of GuidedFilterPreview end at a transmission of 0.2,
// and its result cannot be taken to another size. docs/quality.md has the comparison.
GuidedModel fit_to_guide(Plane& plane, Plane& guide) {
  const int w = plane.width;
  const int h = plane.height;
  const int radius = window_radius(w, h, kGuidedWindowPart);
  Plane mean(w, h);
  Plane guide_mean(w, h);
  Plane slope(w, h);   // first the mean of the product
  Plane offset(w, h);  // first the mean of the guide's square
  AverageFilter_f_Out4Preview(plane.values.data(), guide.values.data(), mean.values.data(),
                              guide_mean.values.data(), slope.values.data(), offset.values.data(),
                              w, h, radius);
  for (size_t i = 0; i < mean.values.size(); ++i) {
    const float m = mean.values[i];
    const float g = guide_mean.values[i];
    const float covariance = slope.values[i] - m * g;
    const float variance = offset.values[i] - g * g;
    slope.values[i] = covariance / (variance + kGuidedRegularization);
    offset.values[i] = m - slope.values[i] * g;
  }
  GuidedModel model = {std::move(mean), std::move(guide_mean)};
  AverageFilter_f_Out2Preview(slope.values.data(), offset.values.data(), model.slope.values.data(),
                              model.offset.values.data(), w, h, radius);
  return model;
}

// Doubled until it covers the size, then cropped to it.
Plane enlarged(Plane plane, int width, int height) {
  while (plane.width < width || plane.height < height) {
    Plane twice(2 * plane.width, 2 * plane.height);
    ZoomIn_Linear_fPreview(plane.values.data(), twice.values.data(), plane.width, plane.height);
    plane = std::move(twice);
  }
  if (plane.width == width && plane.height == height) return plane;
  Plane cropped(width, height);
  for (int y = 0; y < height; ++y) {
    const auto row = plane.values.begin() + static_cast<ptrdiff_t>(y) * plane.width;
    std::copy(row, row + width, cropped.values.begin() + static_cast<ptrdiff_t>(y) * width);
  }
  return cropped;
}

// Least transmission that keeps every channel of the pixel within the range. Of the haze model
// itself: I - A = (J - A) t.
float transmission_for_range(const uint8_t* bgr, const Light& light) {
  float least = 0;
  for (size_t c = 0; c < light.size(); ++c) {
    const float step = static_cast<float>(bgr[c]) - light[c];
    const float room = step > 0 ? kBrightestResult - light[c] : light[c] - kDarkestResult;
    least = std::max(least, std::abs(step) / std::max(room, 1.0F));
  }
  return least;
}

struct Chroma {
  float u;
  float v;
};

// BT.601, around 0.
Chroma chroma_of(const uint8_t* bgr) {
  const float luma = 0.114F * bgr[0] + 0.587F * bgr[1] + 0.299F * bgr[2];
  return {0.564F * (bgr[0] - luma), 0.713F * (bgr[2] - luma)};
}

// Least transmission that keeps a pixel with the tint of a coloured light from getting the opposite
// one: asphalt in yellow haze may turn grey, not blue. What has the opposite tint in spite of the
// haze may get much more of it.
float transmission_for_tint(const uint8_t* bgr, Chroma light) {
  const float tint = std::hypot(light.u, light.v);
  if (tint < kLeastTint) return 0;
  const Chroma pixel = chroma_of(bgr);
  const float along = (pixel.u * light.u + pixel.v * light.v) / tint;
  const float farthest = -kOppositeTint - kOppositeGain * std::max(-along, 0.0F);
  return (tint - along) / (tint - farthest);
}

float largest_share(const uint8_t* bgr, const Light& light, Chroma light_chroma) {
  const float least =
      std::max(transmission_for_range(bgr, light), transmission_for_tint(bgr, light_chroma));
  return 1 - std::clamp(least, 0.0F, 1.0F);
}

}  // namespace

BgrImage half_resolution(Nv21Frame& frame) {
  BgrImage half(frame.width / 2, frame.height / 2);
  uint8_t* luma = frame.bytes.data();
  uint8_t* chroma = luma + static_cast<ptrdiff_t>(frame.width) * frame.height;
  xYCrCb2BGRPreview_NV21(luma, chroma, half.bytes.data(), frame.width, frame.height);
  return half;
}

BgrImage reduced(const BgrImage& image) {
  BgrImage small = image;
  while (longer_side(small) > kLongestSmallSide && shorter_side(small) >= 2 * kShortestSmallSide) {
    small = halved(small);
  }
  return small;
}

double depth_in_view(int x, int y, const BgrImage& image, const Orientation& orientation) {
  const double depth = orientation.transposed ? static_cast<double>(x) / image.width
                                              : static_cast<double>(y) / image.height;
  return orientation.flipped_y ? 1 - depth : depth;
}

Light estimate_light(BgrImage& small, const Orientation& orientation) {
  const int w = small.width;
  const int h = small.height;
  const size_t pixels = small.bytes.size() / 3;
  std::vector<uint8_t> darkest(pixels);
  std::vector<uint8_t> dark(pixels);
  std::vector<int> histogram(256);
  CalculateMinChannelPreview(small.bytes.data(), darkest.data(), w, h, 0);
  const int radius = window_radius(w, h, kLightWindowPart);
  CalculateDarkChannelPreview(darkest.data(), dark.data(), histogram.data(), w, h, radius);
  std::fill(histogram.begin(), histogram.end(), 0);
  uint8_t* value = dark.data();
  for (int y = 0; y < h; ++y) {
    for (int x = 0; x < w; ++x) {
      *value = haze_score(*value, depth_in_view(x, y, small, orientation));
      ++histogram[*value++];
    }
  }
  Light light;
  EstimateAPreview(dark.data(), small.bytes.data(), histogram.data(), light.data(), w, h);
  for (uint8_t& channel : light) channel = std::max<uint8_t>(channel, 1);
  return light;
}

GuidedModel fit_guided_model(BgrImage& small, const Light& light) {
  DarkShares shares = dark_shares(small, light);
  return fit_to_guide(shares.patch, shares.pixel);
}

Plane share_by_pixel(BgrImage& image, const Light& light) {
  return dark_shares(image, light).pixel;
}

Plane share_of_haze(BgrImage& image, const GuidedModel& model, const Light& light) {
  const Plane slope = enlarged(model.slope, image.width, image.height);
  const Plane offset = enlarged(model.offset, image.width, image.height);
  Plane share = share_by_pixel(image, light);
  const Chroma light_chroma = chroma_of(light.data());
  const uint8_t* bgr = image.bytes.data();
  for (size_t i = 0; i < share.values.size(); ++i) {
    const float value = offset.values[i] + slope.values[i] * share.values[i];
    share.values[i] = std::clamp(value, 0.0F, largest_share(bgr, light, light_chroma));
    bgr += 3;
  }
  return share;
}

}  // namespace dehaze
