// Recoveries through reciprocals.
#include "haze_preview.h"
#include "tests/reference/reciprocal_recovery.h"
#include "tests/support/recovery_inputs.h"
#include "tests/surface/blocks.h"
#include "tests/surface/draw.h"

namespace haze::test {
namespace {

using Bytes = std::vector<uint8_t>;
using Plane = std::vector<float>;

struct MappedFrame {
  Size size;
  Bytes light;
  Bytes frame;  // `rows` rows of luma for two of the size
  Plane map;
};

MappedFrame draw_mapped_frame(Choices& choices, int rows) {
  MappedFrame drawn;
  const bool nothing = draws_nothing(choices);
  drawn.size = nothing ? draw_size_without_blocks(choices) : draw_even_size(choices);
  for (int i = 0; i < 3; ++i) drawn.light.push_back(choices.byte());
  if (nothing) return drawn;
  const TransmissionMood mood = choices.one_of(kTransmissionMoods);
  Random random = choices.random();
  drawn.map = make_transmissions(random, mood, drawn.size.width, drawn.size.height);
  drawn.frame = draw_bytes(choices, drawn.size.width, drawn.size.height / 2 * rows);
  return drawn;
}

template <void (*kFunction)(unsigned char*, float*, unsigned char*, int, int, int),
          void (*kDefinition)(uint8_t*, const float*, const uint8_t*, int, int)>
void draw_planar(Choices& choices, Call& call) {
  const MappedFrame drawn = draw_mapped_frame(choices, 3);
  const int ignored = choices.between(-2, 2);
  Bytes want = drawn.frame;
  if (!want.empty())
    kDefinition(want.data(), drawn.map.data(), drawn.light.data(), drawn.size.width,
                drawn.size.height);
  auto* const frame = call.rewrites(drawn.frame, want);
  auto* const t = call.reads(drawn.map);
  auto* const light = call.reads(drawn.light);
  call.runs([=] { kFunction(frame, t, light, drawn.size.width, drawn.size.height, ignored); });
}

void draw_packed(Choices& choices, Call& call) {
  const MappedFrame drawn = draw_mapped_frame(choices, 4);
  Bytes want(drawn.frame.size());
  if (!want.empty())
    reference::recover_packed(drawn.frame.data(), drawn.map.data(), drawn.light.data(), want.data(),
                              drawn.size.width, drawn.size.height);
  auto* const src = call.reads(drawn.frame);
  auto* const t = call.reads(drawn.map);
  auto* const light = call.reads(drawn.light);
  auto* const dst = call.writes(want);
  call.runs([=] { HazeRemovingPreview(src, t, light, dst, drawn.size.width, drawn.size.height); });
}

reference::LightYuv light_of(const Bytes& bytes) { return {bytes[0], bytes[1], bytes[2]}; }

// A stripe whose luma and chroma lie apart.
void draw_stripe(Choices& choices, Call& call) {
  const MappedFrame drawn = draw_mapped_frame(choices, 3);
  const Bytes& frame = drawn.frame;
  const auto middle = static_cast<Bytes::difference_type>(frame.size() / 3 * 2);
  Bytes want = frame;
  if (!want.empty())
    reference::recover_anchors(want.data(), want.data() + middle, drawn.map.data(),
                               light_of(drawn.light), drawn.size.width, drawn.size.height);
  auto* const luma = call.rewrites(Bytes(frame.begin(), frame.begin() + middle),
                                   Bytes(want.begin(), want.begin() + middle));
  auto* const chroma = call.rewrites(Bytes(frame.begin() + middle, frame.end()),
                                     Bytes(want.begin() + middle, want.end()));
  auto* const t = call.reads(drawn.map);
  const uint8_t y = drawn.light[0];
  const uint8_t u = drawn.light[1];
  const uint8_t v = drawn.light[2];
  call.runs([=] {
    HazeRemovingThreadPreview(luma, chroma, t, y, u, v, drawn.size.width, drawn.size.height);
  });
}

void draw_stripe_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const MappedFrame drawn = draw_mapped_frame(choices, 3);
  Bytes want = drawn.frame;
  if (!want.empty() && stripe < 4)
    reference::recover_stripe(want.data(), drawn.map.data(), light_of(drawn.light),
                              drawn.size.width, drawn.size.height, stripe);
  auto* const frame = call.rewrites(drawn.frame, want);
  auto* const t = call.reads(drawn.map);
  call.before([=, light = drawn.light, size = drawn.size] {
    gHRSrcPreview[slot] = frame;
    gHRScalePreview[slot] = t;
    gAYPreview[slot] = light[0];
    gACbPreview[slot] = light[1];
    gACrPreview[slot] = light[2];
    gHRWPreview = size.width;
    gHRHWPreview = size.height;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    HRThreadPreview(&code);
  });
}

}  // namespace

std::vector<Block> reciprocal_blocks() {
  return {
      {"HazeRemovingPreview", Beside::kAny,
       draw_planar<HazeRemovingPreview, reference::recover_anchors>},
      {"HazeRemoving1Preview", Beside::kAny,
       draw_planar<HazeRemoving1Preview, reference::recover_each_integer>},
      {"HazeRemoving2Preview", Beside::kAny,
       draw_planar<HazeRemoving2Preview, reference::recover_each_single>},
      {"HazeRemovingPreview, packed", Beside::kAny, draw_packed},
      {"HazeRemovingThreadPreview", Beside::kAny, draw_stripe},
      {"HRThreadPreview", Beside::kOtherSlots, draw_stripe_worker},
  };
}

}  // namespace haze::test
