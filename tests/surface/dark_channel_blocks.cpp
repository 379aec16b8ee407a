// Minimum and maximum filters of lines, columns and images.
#include <climits>

#include "haze_preview.h"
#include "tests/reference/channel_maps.h"
#include "tests/reference/float_transmission.h"
#include "tests/reference/min_filter.h"
#include "tests/surface/blocks.h"
#include "tests/surface/draw.h"

namespace haze::test {
namespace {

using Bytes = std::vector<uint8_t>;
using Bins = std::vector<int>;
using Plane = std::vector<float>;

// Counts that a histogram holds before it grows.
Bins some_bins() {
  Bins bins(256);
  for (size_t v = 0; v < bins.size(); ++v) bins[v] = static_cast<int>(v % 7);
  return bins;
}

Bins grown(Bins bins, const Bins& by) {
  for (size_t v = 0; v < bins.size(); ++v) bins[v] += by[v];
  return bins;
}

struct FilterArguments {
  Size size;
  int radius;
  bool nothing;
};

FilterArguments draw_arguments(Choices& choices) {
  const int radii[] = {0, 0, 1, 2, 3, 7, 7, 40, 1000, INT_MAX};
  FilterArguments drawn = {{}, choices.one_of(radii), draws_nothing(choices)};
  if (!drawn.nothing) {
    drawn.size = draw_size(choices);
  } else if (choices.one_in(2)) {
    drawn.size = draw_empty_size(choices);
  } else {
    drawn.size = {choices.between(1, 40), choices.between(1, 40)};
    drawn.radius = choices.one_in(2) ? -1 : INT_MIN;
  }
  return drawn;
}

void draw_dark_channel(Choices& choices, Call& call) {
  const FilterArguments args = draw_arguments(choices);
  const Size size = args.size;
  Bytes content, want;
  Bins bins = some_bins();
  if (!args.nothing) {
    content = draw_bytes(choices, size.width, size.height);
    want = reference::square_minimum(content.data(), size.width, size.height, args.radius);
    bins = grown(bins, reference::histogram_of(want.data(), size.width * size.height));
  }
  auto* const src = call.reads(content);
  auto* const dst = call.writes(want);
  auto* const hist = call.rewrites(some_bins(), bins);
  call.runs(
      [=] { CalculateDarkChannelPreview(src, dst, hist, size.width, size.height, args.radius); });
}

void draw_threaded_dark_channel(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const FilterArguments args = draw_arguments(choices);
  const Size size = args.size;
  Bytes content, want;
  Bins bins = some_bins();
  if (!args.nothing) {
    content = draw_bytes(choices, size.width, size.height);
    want.assign(content.size(), 0x77);
  }
  const Bytes fill = want;
  if (!args.nothing && is_slot) {
    want = reference::square_minimum(content.data(), size.width, size.height, args.radius);
    bins = reference::histogram_of(want.data(), size.width * size.height);
  }
  auto* const src = call.reads(content);
  auto* const dst = call.rewrites(fill, want);
  auto* const hist = call.rewrites(some_bins(), bins);
  call.runs([=] {
    CalculateDarkChannel_MultiThreadPreview(src, dst, hist, size.width, size.height, args.radius,
                                            slot);
  });
}

// Outputs `stride` elements apart, with their fill between them.
template <class T>
std::vector<T> spread(const std::vector<T>& outputs, const std::vector<T>& fill, size_t stride) {
  std::vector<T> spread_out = fill;
  for (size_t i = 0; i < outputs.size(); ++i) spread_out[i * stride] = outputs[i];
  return spread_out;
}

struct Line {
  int samples;
  int radius;
  int stride;
  Bytes content;
  Bytes minima;
  Bytes fill;
};

Line draw_line(Choices& choices, int most_stride) {
  const FilterArguments args = draw_arguments(choices);
  Line line = {args.nothing && args.radius >= 0 ? choices.between(-9, 0) : args.size.width,
               args.radius,
               choices.between(1, most_stride),
               {},
               {},
               {}};
  if (args.nothing) return line;
  line.content = draw_bytes(choices, line.samples, 1);
  line.minima = reference::line_minimum(line.content.data(), line.samples, line.radius);
  line.fill.assign(static_cast<size_t>((line.samples - 1) * line.stride + 1), 0x77);
  return line;
}

void draw_line_minimum(Choices& choices, Call& call) {
  const Line line = draw_line(choices, 5);
  auto* const src = call.reads(line.content);
  auto* const dst =
      call.rewrites(line.fill, spread(line.minima, line.fill, static_cast<size_t>(line.stride)));
  call.runs([=] { getMinChannelPreview(src, dst, line.samples, line.stride, line.radius); });
}

void draw_counted_line_minimum(Choices& choices, Call& call) {
  const Line line = draw_line(choices, 5);
  const Bins counted =
      reference::histogram_of(line.minima.data(), static_cast<int>(line.minima.size()));
  auto* const src = call.reads(line.content);
  auto* const dst =
      call.rewrites(line.fill, spread(line.minima, line.fill, static_cast<size_t>(line.stride)));
  auto* const hist = call.rewrites(some_bins(), grown(some_bins(), counted));
  call.runs([=] { getMCandHistPreview(src, dst, hist, line.samples, line.stride, line.radius); });
}

void draw_row_minimum(Choices& choices, Call& call) {
  const Line line = draw_line(choices, 1);
  const int rows = choices.between(-3, 50);
  auto* const src = call.reads(line.content);
  auto* const dst = call.writes(line.minima);
  call.runs([=] { getMinChannel_horPreview(src, dst, line.samples, rows, line.radius); });
}

// A stripe of columns within an image; the columns beside it stay.
void draw_column_minimum(Choices& choices, Call& call) {
  const FilterArguments args = draw_arguments(choices);
  const Size stripe = args.size;
  const int beside = choices.between(0, 20);
  const int image_width = args.nothing ? 8 : stripe.width + beside;
  Bytes content, want;
  Bins bins = some_bins();
  if (!args.nothing) {
    content = draw_bytes(choices, image_width, stripe.height);
    const Bytes minima =
        reference::column_minimum(content.data(), image_width, stripe.height, args.radius);
    bins = grown(bins, reference::histogram_of_columns(minima.data(), image_width, stripe.height, 0,
                                                       stripe.width));
    want.assign(content.size(), 0x77);
    for (size_t i = 0; i < want.size(); ++i)
      if (static_cast<int>(i % static_cast<size_t>(image_width)) < stripe.width)
        want[i] = minima[i];
    // The image may end with the stripe's last row.
    content.resize(content.size() - static_cast<size_t>(beside));
    want.resize(content.size());
  }
  auto* const src = call.reads(content);
  auto* const dst = call.rewrites(Bytes(want.size(), 0x77), want);
  auto* const hist = call.rewrites(some_bins(), bins);
  call.before([=] { gCalDCWPreview = image_width; });
  call.runs(
      [=] { getMinChannel_verPreview(src, dst, stripe.width, stripe.height, args.radius, hist); });
}

// One stripe of either pass of the threaded dark channel.
template <bool kRows>
void draw_dark_channel_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const FilterArguments args = draw_arguments(choices);
  const Size size = args.size;
  Bytes content, want;
  std::vector<unsigned> counters(256, 7);
  if (stripe < 4 && !kRows) counters.assign(256, 0);
  if (!args.nothing) {
    content = draw_bytes(choices, size.width, size.height);
    want.assign(content.size(), 0x77);
  }
  if (!args.nothing && stripe < 4) {
    const auto filter = kRows ? reference::row_minimum : reference::column_minimum;
    const Bytes minima = filter(content.data(), size.width, size.height, args.radius);
    const reference::ImageRows own =
        reference::even_stripe_rows(kRows ? size.height : size.width, 4, stripe);
    const auto is_own = [&](int i) { return i >= own.first && i < own.first + own.count; };
    for (int i = 0; i < static_cast<int>(want.size()); ++i)
      if (is_own(kRows ? i / size.width : i % size.width))
        want[static_cast<size_t>(i)] = minima[static_cast<size_t>(i)];
    if (!kRows) {
      const Bins bins = reference::histogram_of_columns(minima.data(), size.width, size.height,
                                                        own.first, own.count);
      counters.assign(bins.begin(), bins.end());
    }
  }
  auto* const src = call.reads(content);
  auto* const dst = call.rewrites(Bytes(want.size(), 0x77), want);
  if (stripe < 4)
    call.leaves(gHistPreview + (slot * 4 + stripe) * 256, std::vector<unsigned>(256, 7), counters);
  call.before([=] {
    gCalDCSrcPreview[slot] = src;
    gCalDCDstPreview[slot] = dst;
    gCalDCWPreview = size.width;
    gCalDCHPreview = size.height;
    gCalDCRPreview = args.radius;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    kRows ? CalDCThread_horPreview(&code) : CalDCThread_verPreview(&code);
  });
}

void draw_line_maximum(Choices& choices, Call& call) {
  const FilterArguments args = draw_arguments(choices);
  const int samples = args.nothing && args.radius >= 0 ? choices.between(-9, 0) : args.size.width;
  const bool with_stride = choices.one_in(2);
  const int stride = with_stride ? choices.between(1, 5) : 1;
  Plane content, want;
  if (!args.nothing) {
    content = draw_plane(choices, {samples, 1});
    want.assign(static_cast<size_t>((samples - 1) * stride + 1), 0.5f);
  }
  const Plane fill = want;
  if (!args.nothing)
    want = spread(reference::window_maximum(content.data(), samples, args.radius), fill,
                  static_cast<size_t>(stride));
  auto* const src = call.reads(content);
  auto* const dst = call.rewrites(fill, want);
  call.runs([=] {
    with_stride ? getMaxChannelPreview(src, dst, samples, stride, args.radius)
                : getMaxChannel_horPreview(src, dst, samples, 17, args.radius);
  });
}

void draw_column_maximum(Choices& choices, Call& call) {
  const FilterArguments args = draw_arguments(choices);
  const Size size = args.size;
  Plane content, want;
  if (!args.nothing) {
    content = draw_plane(choices, size);
    want = reference::maximum_of_columns(content, size.width, size.height, args.radius);
  }
  auto* const src = call.reads(content);
  auto* const dst = call.writes(want);
  call.runs([=] { getMaxChannel_verPreview(src, dst, size.width, size.height, args.radius); });
}

}  // namespace

std::vector<Block> dark_channel_blocks() {
  return {
      {"CalculateDarkChannelPreview", Beside::kAny, draw_dark_channel},
      {"CalculateDarkChannel_MultiThreadPreview", Beside::kOtherSlots, draw_threaded_dark_channel},
      {"getMinChannelPreview", Beside::kAny, draw_line_minimum},
      {"getMCandHistPreview", Beside::kAny, draw_counted_line_minimum},
      {"getMinChannel_horPreview", Beside::kAny, draw_row_minimum},
      {"getMinChannel_verPreview", Beside::kOtherSlots, draw_column_minimum},
      {"CalDCThread_horPreview", Beside::kOtherSlots, draw_dark_channel_worker<true>},
      {"CalDCThread_verPreview", Beside::kOtherSlots, draw_dark_channel_worker<false>},
      {"getMaxChannelPreview, getMaxChannel_horPreview", Beside::kAny, draw_line_maximum},
      {"getMaxChannel_verPreview", Beside::kAny, draw_column_maximum},
  };
}

}  // namespace haze::test
