// Channel extraction, colour conversions, channel maps.
#include "haze_preview.h"
#include "tests/reference/channel_maps.h"
#include "tests/reference/color_convert.h"
#include "tests/reference/max_min_nv21.h"
#include "tests/surface/blocks.h"
#include "tests/surface/draw.h"

namespace haze::test {
namespace {

using Bytes = std::vector<uint8_t>;
using ByteFunction = void (*)(unsigned char*, unsigned char*, int, int);
using Nv21Function = void (*)(unsigned char*, unsigned char*, unsigned char*, int, int);

// A call with a size that gives it nothing to do, and buffers that may not be touched at all.
void run_on_nothing(Choices& choices, Call& call, ByteFunction function) {
  const Size size = draw_empty_size(choices);
  auto* const src = call.reads(Bytes());
  auto* const dst = call.writes(Bytes());
  call.runs([=] { function(src, dst, size.width, size.height); });
}

void run_on_nothing(Choices& choices, Call& call, Nv21Function function) {
  const Size size = draw_empty_size(choices);
  auto* const luma = call.reads(Bytes());
  auto* const chroma = call.reads(Bytes());
  auto* const bgr = call.writes(Bytes());
  call.runs([=] { function(luma, chroma, bgr, size.width, size.height); });
}

void draw_max_min_nv21(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes luma, chroma, least, most;
  if (!nothing) {
    luma = draw_bytes(choices, size.width, size.height);
    chroma = draw_bytes(choices, size.width, size.height / 2);
    least.resize(size.half().area());
    most.resize(size.half().area());
    reference::max_min_nv21(luma.data(), chroma.data(), least.data(), most.data(), size.width,
                            size.height);
  }
  auto* const y = call.reads(luma);
  auto* const vu = call.reads(chroma);
  auto* const min_out = call.writes(least);
  auto* const max_out = call.writes(most);
  call.runs(
      [=] { xYCrCb2BGRMaxMinPreviewNeon_NV21(y, vu, min_out, max_out, size.width, size.height); });
}

void draw_half_bgr_nv21(Choices& choices, Call& call) {
  if (draws_nothing(choices)) return run_on_nothing(choices, call, xYCrCb2BGRPreview_NV21);
  const Size size = draw_size(choices);
  const Size blocks = size.half_rounded_up();
  const Bytes luma = draw_bytes(choices, size.width, size.height);
  const Bytes chroma = draw_bytes(choices, 2 * blocks.width, blocks.height);
  Bytes want(3 * blocks.area());
  reference::half_bgr_nv21(luma.data(), chroma.data(), want.data(), size.width, size.height);
  auto* const y = call.reads(luma);
  auto* const vu = call.reads(chroma);
  auto* const bgr = call.writes(want);
  call.runs([=] { xYCrCb2BGRPreview_NV21(y, vu, bgr, size.width, size.height); });
}

void draw_half_bgr_nv21_rounded_down(Choices& choices, Call& call) {
  if (draws_nothing(choices)) return run_on_nothing(choices, call, xYCrCb2BGRPreviewNeon_NV21);
  const Size size = draw_size(choices);
  const Size blocks = size.half();
  const Bytes luma = draw_bytes(choices, size.width, size.height);
  const Bytes chroma = draw_bytes(choices, 2 * blocks.width, blocks.height);
  Bytes want(3 * blocks.area());
  reference::half_bgr_nv21_rounded_down(luma.data(), chroma.data(), want.data(), size.width,
                                        size.height);
  auto* const y = call.reads(luma);
  auto* const vu = call.reads(chroma);
  auto* const bgr = call.writes(want);
  call.runs([=] { xYCrCb2BGRPreviewNeon_NV21(y, vu, bgr, size.width, size.height); });
}

void draw_half_bgr_planar(Choices& choices, Call& call) {
  if (draws_nothing(choices)) return run_on_nothing(choices, call, xYCrCb2BGRPreview);
  const Size size = draw_size(choices);
  const Size blocks = size.half_rounded_up();
  // The frame that the stripe belongs to has a V plane at least as far away as the stripe's end.
  const Size frame = {2 * blocks.width, 2 * (blocks.height + choices.between(0, 8))};
  const size_t v_offset = frame.area() / 4;
  const Bytes luma = draw_bytes(choices, size.width, size.height);
  Bytes chroma = draw_bytes(choices, static_cast<int>(v_offset + blocks.area()), 1);
  Bytes want(3 * blocks.area());
  reference::half_bgr_planar(luma.data(), chroma.data(), chroma.data() + v_offset, want.data(),
                             size.width, size.height);
  auto* const y = call.reads(luma);
  auto* const u = call.reads(chroma);
  auto* const bgr = call.writes(want);
  call.before([=] {
    gZoomOutWPreview = frame.width;
    gZoomOutHPreview = frame.height;
  });
  call.runs([=] { xYCrCb2BGRPreview(y, u, bgr, size.width, size.height); });
}

// The conversions from one packed layout to another.
template <ByteFunction kFunction, void (*kDefinition)(const uint8_t*, uint8_t*, int, int),
          int kBytesIn, int kBytesOut>
void draw_conversion(Choices& choices, Call& call) {
  if (draws_nothing(choices)) return run_on_nothing(choices, call, kFunction);
  const Size size = draw_size(choices);
  const Bytes content = draw_bytes(choices, kBytesIn * size.width, size.height);
  Bytes want(kBytesOut * size.area());
  kDefinition(content.data(), want.data(), size.width, size.height);
  auto* const src = call.reads(content);
  auto* const dst = call.writes(want);
  call.runs([=] { kFunction(src, dst, size.width, size.height); });
}

struct Maps {
  Size size;
  uint8_t* src;
  uint8_t* least;
  uint8_t* most;
};

// The maps of some rows of an image; the others keep their fill.
Maps draw_maps(Choices& choices, Call& call, bool works, int stripes = 1, int stripe = 0) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes content, least, most;
  if (!nothing) {
    content = draw_bytes(choices, 3 * size.width, size.height);
    least.resize(size.area());
    most.resize(size.area());
    reference::channel_maps(content.data(), least.data(), most.data(), size.width,
                            reference::all_rows(size.height));
  }
  const Bytes fill(least.size(), 0x77);
  Bytes wanted_least = works ? least : fill;
  Bytes wanted_most = works ? most : fill;
  if (stripes > 1) {
    wanted_least = wanted_most = fill;
    if (!nothing && works)
      reference::channel_maps(content.data(), wanted_least.data(), wanted_most.data(), size.width,
                              reference::even_stripe_rows(size.height, stripes, stripe));
  }
  return {size, call.reads(content), call.rewrites(fill, wanted_least),
          call.rewrites(fill, wanted_most)};
}

void draw_channel_maps(Choices& choices, Call& call) {
  const Maps maps = draw_maps(choices, call, true);
  call.runs([=] {
    CalculateMaxMinChannel(maps.src, maps.least, maps.most, maps.size.width, maps.size.height);
  });
}

void draw_threaded_channel_maps(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const Maps maps = draw_maps(choices, call, is_slot);
  call.runs_for_result([=] {
    return CalculateMaxMinChannelPreview(maps.src, maps.least, maps.most, maps.size.width,
                                         maps.size.height, slot);
  });
}

void draw_channel_maps_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const Maps maps = draw_maps(choices, call, stripe < 8, 8, stripe);
  call.before([=] {
    gCalMaxMinSrcPreview[slot] = maps.src;
    gCalMaxMinDstMinPreview[slot] = maps.least;
    gCalMaxMinDstMaxPreview[slot] = maps.most;
    gCalMaxMinWPreview = maps.size.width;
    gCalMaxMinHPreview = maps.size.height;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    CalMaxMinThreadPreview(&code);
  });
}

// The minimum alone: the other map stays out of the call.
struct MinimumMap {
  Size size;
  uint8_t* src;
  uint8_t* dst;
};

MinimumMap draw_minimum_map(Choices& choices, Call& call, bool works, int stripes = 1,
                            int stripe = 0) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes content, want;
  if (!nothing) {
    content = draw_bytes(choices, 3 * size.width, size.height);
    want.assign(size.area(), 0x77);
    if (works)
      reference::channel_maps(content.data(), want.data(), nullptr, size.width,
                              stripes == 1
                                  ? reference::all_rows(size.height)
                                  : reference::even_stripe_rows(size.height, stripes, stripe));
  }
  return {size, call.reads(content), call.rewrites(Bytes(want.size(), 0x77), want)};
}

void draw_threaded_minimum_map(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const MinimumMap map = draw_minimum_map(choices, call, is_slot);
  call.runs_for_result([=] {
    return CalculateMinChannelPreview(map.src, map.dst, map.size.width, map.size.height, slot);
  });
}

void draw_minimum_map_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const MinimumMap map = draw_minimum_map(choices, call, stripe < 4, 4, stripe);
  call.before([=] {
    gCalMCSrcPreview[slot] = map.src;
    gCalMCDstPreview[slot] = map.dst;
    gCalMCWPreview = map.size.width;
    gCalMCHPreview = map.size.height;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    CalMCThreadPreview(&code);
  });
}

}  // namespace

std::vector<Block> color_blocks() {
  return {
      {"xYCrCb2BGRMaxMinPreviewNeon_NV21", Beside::kAny, draw_max_min_nv21},
      {"xYCrCb2BGRPreview_NV21", Beside::kAny, draw_half_bgr_nv21},
      {"xYCrCb2BGRPreviewNeon_NV21", Beside::kAny, draw_half_bgr_nv21_rounded_down},
      {"xYCrCb2BGRPreview", Beside::kOtherSlots, draw_half_bgr_planar},
      {"BGR2YCrCbPreview", Beside::kAny,
       draw_conversion<BGR2YCrCbPreview, reference::bgr_to_ycrcb, 3, 3>},
      {"YCrCb2BGRPreview", Beside::kAny,
       draw_conversion<YCrCb2BGRPreview, reference::ycrcb_to_bgr, 3, 3>},
      {"xBGR2YCrCbPreview", Beside::kAny,
       draw_conversion<xBGR2YCrCbPreview, reference::bgr_to_two_bytes, 3, 2>},
      {"split_4componentPreview", Beside::kAny,
       draw_conversion<split_4componentPreview, reference::split_components, 4, 4>},
      {"CalculateMaxMinChannel", Beside::kAny, draw_channel_maps},
      {"CalculateMaxMinChannelPreview", Beside::kOtherSlots, draw_threaded_channel_maps},
      {"CalMaxMinThreadPreview", Beside::kOtherSlots, draw_channel_maps_worker},
      {"CalculateMinChannelPreview", Beside::kOtherSlots, draw_threaded_minimum_map},
      {"CalMCThreadPreview", Beside::kOtherSlots, draw_minimum_map_worker},
  };
}

}  // namespace haze::test
