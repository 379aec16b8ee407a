// Box filters and the guided filter.
#include <algorithm>
#include <climits>

#include "haze_preview.h"
#include "tests/reference/box_float.h"
#include "tests/reference/box_integer.h"
#include "tests/reference/guided_filter.h"
#include "tests/surface/blocks.h"
#include "tests/surface/draw.h"

namespace haze::test {
namespace {

using Bytes = std::vector<uint8_t>;
using Plane = std::vector<float>;
using reference::Averaged;

struct Window {
  Size size;
  int radius;
  bool fits;
};

// An image that holds the window of a radius, or, now and then, one that does not.
Window draw_window(Choices& choices) {
  const int radius = choices.one_in(4) ? choices.between(1, 40) : choices.between(1, 8);
  if (!draws_nothing(choices)) return {draw_size(choices, 2 * radius + 1), radius, true};
  switch (choices.between(0, 3)) {
    case 0:
      return {draw_empty_size(choices), radius, false};
    case 1:
      return {{2 * radius, 2 * radius + 5}, radius, false};
    case 2:
      return {{2 * radius + 5, 2 * radius}, radius, false};
    default: {
      const int radii[] = {0, -1, -7, INT_MAX, INT_MIN, 1 << 30};
      return {draw_size(choices), choices.one_of(radii), false};
    }
  }
}

void draw_mean_64(Choices& choices, Call& call) {
  const bool fits = !draws_nothing(choices);
  const Size size =
      fits ? draw_size(choices, 64) : Size{choices.between(-70, 63), choices.between(-1, 200)};
  const int radius = choices.between(-100, 100);
  Bytes content, want;
  std::vector<short> sums;
  if (fits) {
    content = draw_bytes(choices, size.width, size.height);
    want.resize(content.size());
    reference::box_mean(content.data(), want.data(), size.width, size.height, reference::kWindow64);
    for (const int sum : reference::box_column_sums_at_end(content.data(), size.width, size.height,
                                                           reference::kWindow64))
      sums.push_back(static_cast<short>(sum));
  }
  auto* const src = call.reads(content);
  auto* const dst = call.writes(want);
  auto* const scratch = call.writes(sums);
  call.runs([=] { AverageFilterShort64_u8(src, dst, size.width, size.height, radius, scratch); });
}

void draw_mean(Choices& choices, Call& call) {
  const Window window = draw_window(choices);
  const Size size = window.size;
  Bytes content, want;
  std::vector<int> sums;
  if (window.fits) {
    const reference::BoxWindow box = reference::window_of_radius(window.radius);
    content = draw_bytes(choices, size.width, size.height);
    want.resize(content.size());
    reference::box_mean(content.data(), want.data(), size.width, size.height, box);
    sums = reference::box_column_sums_at_end(content.data(), size.width, size.height, box);
  }
  auto* const src = call.reads(content);
  auto* const dst = call.writes(want);
  auto* const scratch = call.writes(sums);
  call.runs([=] { AverageFilter_u8(src, dst, size.width, size.height, window.radius, scratch); });
}

// Two planes, and the means that are asked for.
struct FloatMeans {
  Window window;
  float* a;
  float* b;
  float* means[4];
};

FloatMeans draw_float_means(Choices& choices, Call& call,
                            std::initializer_list<Averaged> quantities) {
  FloatMeans drawn = {draw_window(choices), nullptr, nullptr, {}};
  const Window& window = drawn.window;
  Plane a, b;
  if (window.fits) {
    a = draw_plane(choices, window.size);
    b = draw_plane(choices, window.size);
  }
  drawn.a = call.reads(a);
  drawn.b = call.reads(b);
  float** mean = drawn.means;
  for (const Averaged quantity : quantities)
    *mean++ = call.writes(window.fits ? reference::box_mean_float(a.data(), b.data(), quantity,
                                                                  window.size.width,
                                                                  window.size.height, window.radius)
                                      : Plane());
  return drawn;
}

void draw_mean_of_plane(Choices& choices, Call& call) {
  const FloatMeans f = draw_float_means(choices, call, {Averaged::kFirst});
  call.runs([=] {
    AverageFilter_fPreview(f.a, f.means[0], f.window.size.width, f.window.size.height,
                           f.window.radius);
  });
}

void draw_mean_of_square(Choices& choices, Call& call) {
  const FloatMeans f = draw_float_means(choices, call, {Averaged::kSecondSquared});
  call.runs([=] {
    AverageFilter_f_2Preview(f.b, f.means[0], f.window.size.width, f.window.size.height,
                             f.window.radius);
  });
}

void draw_mean_of_product(Choices& choices, Call& call) {
  const FloatMeans f = draw_float_means(choices, call, {Averaged::kProduct});
  call.runs([=] {
    AverageFilter_fPreview(f.a, f.b, f.means[0], f.window.size.width, f.window.size.height,
                           f.window.radius);
  });
}

void draw_two_means(Choices& choices, Call& call) {
  const FloatMeans f = draw_float_means(choices, call, {Averaged::kFirst, Averaged::kSecond});
  call.runs([=] {
    AverageFilter_f_Out2Preview(f.a, f.b, f.means[0], f.means[1], f.window.size.width,
                                f.window.size.height, f.window.radius);
  });
}

void draw_four_means(Choices& choices, Call& call) {
  const FloatMeans f = draw_float_means(
      choices, call,
      {Averaged::kFirst, Averaged::kSecond, Averaged::kProduct, Averaged::kSecondSquared});
  call.runs([=] {
    AverageFilter_f_Out4Preview(f.a, f.b, f.means[0], f.means[1], f.means[2], f.means[3],
                                f.window.size.width, f.window.size.height, f.window.radius);
  });
}

void draw_guided_filter(Choices& choices, Call& call) {
  const Window window = draw_window(choices);
  const Size size = window.size;
  Plane plane, guide;
  Bytes want;
  if (window.fits) {
    plane = draw_plane(choices, size);
    guide = draw_plane(choices, size);
    want = reference::guided_filter(plane.data(), guide.data(), size.width, size.height,
                                    window.radius);
  }
  auto* const p = call.reads(plane);
  auto* const i = call.reads(guide);
  auto* const out = call.writes(want);
  call.runs([=] { GuidedFilterPreview(p, i, out, size.width, size.height, window.radius); });
}

}  // namespace

std::vector<Block> filter_blocks() {
  return {
      {"AverageFilterShort64_u8", Beside::kAny, draw_mean_64},
      {"AverageFilter_u8", Beside::kAny, draw_mean},
      {"AverageFilter_fPreview, one plane", Beside::kAny, draw_mean_of_plane},
      {"AverageFilter_f_2Preview", Beside::kAny, draw_mean_of_square},
      {"AverageFilter_fPreview, two planes", Beside::kAny, draw_mean_of_product},
      {"AverageFilter_f_Out2Preview", Beside::kAny, draw_two_means},
      {"AverageFilter_f_Out4Preview", Beside::kAny, draw_four_means},
      {"GuidedFilterPreview", Beside::kAny, draw_guided_filter},
  };
}

}  // namespace haze::test
