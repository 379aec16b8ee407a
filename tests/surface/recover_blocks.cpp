// Recoveries from transmission codes and by division, brightness lift, zoom.
#include "haze_preview.h"
#include "tests/reference/brightness.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/recovery_variants.h"
#include "tests/reference/zoom.h"
#include "tests/support/recovery_inputs.h"
#include "tests/support/slot_tables.h"
#include "tests/surface/blocks.h"
#include "tests/surface/draw.h"

namespace haze::test {
namespace {

using Bytes = std::vector<uint8_t>;
using Plane = std::vector<float>;

Bytes draw_frame(Choices& choices, Size size) {
  return draw_bytes(choices, size.width, size.height / 2 * 3);
}

Bytes draw_light(Choices& choices) {
  Bytes light(3, choices.byte());
  if (choices.one_in(2)) return light;
  for (uint8_t& channel : light) channel = choices.byte();
  return light;
}

// Half of the maps have codes as the transmission maps have them, half any.
Bytes draw_codes(Choices& choices, Size size) {
  Bytes codes = draw_bytes(choices, size.width / 2, size.height / 2);
  if (choices.one_in(2))
    for (uint8_t& code : codes) code = static_cast<uint8_t>(40 + code % 119);
  return codes;
}

struct CodedFrame {
  Size size;
  Bytes frame;
  Bytes codes;
  Bytes light;
};

CodedFrame draw_coded_frame(Choices& choices) {
  CodedFrame drawn;
  const bool nothing = draws_nothing(choices);
  drawn.size = nothing ? draw_size_without_blocks(choices) : draw_even_size(choices);
  drawn.light = draw_light(choices);
  if (nothing) return drawn;
  drawn.frame = draw_frame(choices, drawn.size);
  drawn.codes = draw_codes(choices, drawn.size);
  return drawn;
}

template <void (*kFunction)(unsigned char*, unsigned char*, unsigned char*, int, int, int),
          void (*kDefinition)(uint8_t*, const uint8_t*, const uint8_t*, int, int)>
void draw_recovery(Choices& choices, Call& call) {
  const CodedFrame drawn = draw_coded_frame(choices);
  const int ignored = choices.between(-3, 3);
  Bytes want = drawn.frame;
  if (!want.empty())
    kDefinition(want.data(), drawn.codes.data(), drawn.light.data(), drawn.size.width,
                drawn.size.height);
  auto* const frame = call.rewrites(drawn.frame, want);
  auto* const codes = call.reads(drawn.codes);
  auto* const light = call.reads(drawn.light);
  call.runs([=] { kFunction(frame, codes, light, drawn.size.width, drawn.size.height, ignored); });
}

// The tables of a slot, as the call is to leave them.
void leaves_tables(Call& call, int slot, const reference::SlotTables& before,
                   const reference::SlotTables& after) {
  const int start = slot * reference::kTableEntries;
  call.leaves(gTable1 + start, before.luma, after.luma);
  call.leaves(gTable2 + start, before.v, after.v);
  call.leaves(gTable3 + start, before.u, after.u);
}

void draw_recovery_by_new_tables(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const CodedFrame drawn = draw_coded_frame(choices);
  Bytes want = drawn.frame;
  if (is_slot) {
    const reference::SlotTables tables = reference::slot_tables(drawn.light.data());
    if (!want.empty())
      reference::apply_tables(want.data(), drawn.codes.data(), tables, drawn.size.width,
                              drawn.size.height, {0, drawn.size.height / 2});
    Random random = choices.random();
    leaves_tables(call, slot, odd_tables(random), tables);
  }
  auto* const frame = call.rewrites(drawn.frame, want);
  auto* const codes = call.reads(drawn.codes);
  auto* const light = call.reads(drawn.light);
  call.runs([=] {
    HazeRemoving3Preview2_NV21(frame, codes, light, drawn.size.width, drawn.size.height, slot);
  });
}

void draw_recovery_by_tables(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const CodedFrame drawn = draw_coded_frame(choices);
  Bytes want = drawn.frame;
  Random random = choices.random();
  const reference::SlotTables tables = odd_tables(random);
  if (is_slot) {
    leaves_tables(call, slot, tables, tables);
    if (!want.empty())
      reference::apply_tables(want.data(), drawn.codes.data(), tables, drawn.size.width,
                              drawn.size.height, {0, drawn.size.height / 2});
  }
  auto* const frame = call.rewrites(drawn.frame, want);
  auto* const codes = call.reads(drawn.codes);
  call.runs(
      [=] { CalculateRemovePreview(frame, codes, drawn.size.width, drawn.size.height, slot); });
}

void draw_tables_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const CodedFrame drawn = draw_coded_frame(choices);
  Bytes want = drawn.frame;
  Random random = choices.random();
  const reference::SlotTables tables = odd_tables(random);
  leaves_tables(call, slot, tables, tables);
  if (!want.empty() && stripe < 8)
    reference::apply_tables(want.data(), drawn.codes.data(), tables, drawn.size.width,
                            drawn.size.height,
                            reference::recovery_stripe(drawn.size.height, stripe));
  auto* const frame = call.rewrites(drawn.frame, want);
  auto* const codes = call.reads(drawn.codes);
  call.before([=] {
    gCalRemoveSrcPreview[slot] = frame;
    gCalRemoveScalePreview[slot] = codes;
    gCalRemoveWPreview = drawn.size.width;
    gCalRemoveHPreview = drawn.size.height;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    CalRemoveThreadPreview(&code);
  });
}

void draw_recovery_by_division(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_size_without_blocks(choices) : draw_even_size(choices);
  const Bytes light_bgr = draw_light(choices);
  Bytes content, want;
  Plane map;
  if (!nothing) {
    const TransmissionMood mood = choices.one_of(kTransmissionMoods);
    Random random = choices.random();
    map = make_transmissions(random, mood, size.width, size.height);
    want = content = draw_frame(choices, size);
    reference::recover_nv21_float(want.data(), map.data(), light_bgr.data(), size.width,
                                  size.height);
  }
  auto* const frame = call.rewrites(content, want);
  auto* const t = call.reads(map);
  auto* const light = call.reads(light_bgr);
  call.runs([=] { HazeRemoving3Preview_NV21_f(frame, t, light, size.width, size.height, 0); });
}

void draw_brightness(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes content;
  if (!nothing) content = draw_bytes(choices, 2 * size.width, size.height);
  Bytes want = content;
  for (size_t i = 0; i < want.size(); i += 2) want[i] = reference::lifted_byte(want[i]);
  auto* const buf = call.rewrites(content, want);
  call.runs([=] { ImproveBrightnessPreview(buf, size.width, size.height); });
}

struct ZoomedFrame {
  Size size;
  INPUT_FORMAT format;
  Bytes frame;
  Bytes fill;
};

ZoomedFrame draw_zoomed_frame(Choices& choices) {
  ZoomedFrame drawn;
  drawn.format = choices.one_in(2) ? kInputFormatPlanar : kInputFormatNv21;
  const bool nothing = draws_nothing(choices);
  drawn.size = nothing ? draw_size_without_blocks(choices) : draw_even_size(choices);
  if (nothing) return drawn;
  drawn.frame = draw_frame(choices, drawn.size);
  drawn.fill.assign(3 * drawn.size.half().area(), 0x77);
  return drawn;
}

void draw_zoom_out(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const ZoomedFrame drawn = draw_zoomed_frame(choices);
  Bytes want = drawn.fill;
  if (is_slot && !want.empty())
    reference::zoom_out(drawn.frame.data(), want.data(), drawn.size.width, drawn.size.height,
                        drawn.format == kInputFormatPlanar);
  auto* const src = call.reads(drawn.frame);
  auto* const dst = call.rewrites(drawn.fill, want);
  call.before([=] { gPerviewFormat = drawn.format; });
  call.runs([=] { ZoomOutImgPreview(src, dst, drawn.size.width, drawn.size.height, slot); });
}

void draw_zoom_out_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const ZoomedFrame drawn = draw_zoomed_frame(choices);
  Bytes want = drawn.fill;
  if (!want.empty() && stripe < 8)
    reference::zoom_out_rows(drawn.frame.data(), want.data(), drawn.size.width, drawn.size.height,
                             drawn.format == kInputFormatPlanar,
                             reference::zoom_out_stripe(drawn.size.height, stripe));
  auto* const src = call.reads(drawn.frame);
  auto* const dst = call.rewrites(drawn.fill, want);
  call.before([=] {
    gPerviewFormat = drawn.format;
    gZoomOutSrcPreview[slot] = src;
    gZoomOutDstPreview[slot] = dst;
    gZoomOutWPreview = drawn.size.width;
    gZoomOutHPreview = drawn.size.height;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    ZoomOutThreadPreview(&code);
  });
}

void draw_zoom_in(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Plane content, want;
  if (!nothing) {
    content = draw_plane(choices, size);
    want.resize(4 * content.size());
    reference::zoom_in(content.data(), want.data(), size.width, size.height);
  }
  auto* const src = call.reads(content);
  auto* const dst = call.writes(want);
  call.runs([=] { ZoomIn_Linear_fPreview(src, dst, size.width, size.height); });
}

}  // namespace

std::vector<Block> recover_blocks() {
  return {
      {"HazeRemoving3Preview", Beside::kAny,
       draw_recovery<HazeRemoving3Preview, reference::recover_planar>},
      {"HazeRemoving3Preview_NV21", Beside::kAny,
       draw_recovery<HazeRemoving3Preview_NV21, reference::recover_nv21>},
      {"HazeRemoving3Preview2_NV21", Beside::kNone, draw_recovery_by_new_tables},
      {"CalculateRemovePreview", Beside::kOtherSlots, draw_recovery_by_tables},
      {"CalRemoveThreadPreview", Beside::kOtherSlots, draw_tables_worker},
      {"HazeRemoving3Preview_NV21_f", Beside::kAny, draw_recovery_by_division},
      {"ImproveBrightnessPreview", Beside::kAny, draw_brightness},
      {"ZoomOutImgPreview", Beside::kOtherSlots, draw_zoom_out},
      {"ZoomOutThreadPreview", Beside::kOtherSlots, draw_zoom_out_worker},
      {"ZoomIn_Linear_fPreview", Beside::kAny, draw_zoom_in},
  };
}

}  // namespace haze::test
