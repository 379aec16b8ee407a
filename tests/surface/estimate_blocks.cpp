// Transmission maps, atmospheric light, sampled statistics, float transmission.
#include <array>
#include <climits>
#include <limits>

#include "haze_preview.h"
#include "tests/reference/atmospheric_light.h"
#include "tests/reference/float_transmission.h"
#include "tests/reference/min_filter.h"
#include "tests/reference/transmission.h"
#include "tests/surface/blocks.h"
#include "tests/surface/draw.h"

namespace haze::test {
namespace {

using Bytes = std::vector<uint8_t>;
using Plane = std::vector<float>;
using reference::GroupMinimum;

// Two maps and the codes made of them; empty where there is nothing to do.
struct TransmissionMaps {
  Size size;
  Bytes mean;
  Bytes least;
};

TransmissionMaps draw_transmission_maps(Choices& choices) {
  TransmissionMaps maps;
  const bool nothing = draws_nothing(choices);
  maps.size = nothing ? draw_empty_size(choices) : draw_size(choices);
  if (nothing) return maps;
  maps.mean = draw_bytes(choices, maps.size.width, maps.size.height);
  maps.least = draw_bytes(choices, maps.size.width, maps.size.height);
  return maps;
}

float draw_strength(Choices& choices) {
  const float odd[] = {0.0f,
                       -0.0f,
                       -1.0f,
                       7.0f,
                       1.0e30f,
                       1.0e-39f,
                       -1.0e-39f,
                       std::numeric_limits<float>::infinity(),
                       std::numeric_limits<float>::quiet_NaN()};
  if (choices.one_in(4)) return choices.one_of(odd);
  return static_cast<float>(choices.between(-200, 400)) * 7.0f / 117.0f;
}

template <void (*kFunction)(unsigned char*, unsigned char*, unsigned char*, int, int, float, float),
          GroupMinimum kGroupMinimum>
void draw_transmission(Choices& choices, Call& call) {
  const TransmissionMaps maps = draw_transmission_maps(choices);
  const float strength = draw_strength(choices);
  const int light = choices.between(0, 255);
  const float inv_a =
      light == 0 ? std::numeric_limits<float>::infinity() : 1.0f / static_cast<float>(light);
  Bytes want(maps.mean.size());
  reference::transmission_map(maps.mean.data(), maps.least.data(), want.data(), maps.size.width,
                              maps.size.height, strength, inv_a, kGroupMinimum);
  auto* const mean = call.reads(maps.mean);
  auto* const least = call.reads(maps.least);
  auto* const codes = call.writes(want);
  call.runs(
      [=] { kFunction(mean, least, codes, maps.size.width, maps.size.height, strength, inv_a); });
}

int draw_strength_q8(Choices& choices) {
  const int odd[] = {INT_MAX, INT_MIN, -256, 0, 1 << 24, -1};
  return choices.one_in(6) ? choices.one_of(odd) : choices.between(0, 1024);
}

void draw_threaded_transmission(Choices& choices, Call& call) {
  bool is_slot;
  const int slot = draw_slot(choices, is_slot);
  const TransmissionMaps maps = draw_transmission_maps(choices);
  const int strength = draw_strength_q8(choices);
  const int light = choices.between(0, 255);
  const Bytes fill(maps.mean.size(), 0x77);
  Bytes want = fill;
  if (is_slot)
    reference::transmission_map_q8(maps.mean.data(), maps.least.data(), want.data(),
                                   maps.size.width, maps.size.height, strength, light);
  auto* const mean = call.reads(maps.mean);
  auto* const least = call.reads(maps.least);
  auto* const codes = call.rewrites(fill, want);
  call.runs([=] {
    CalculateTChannelPreview(mean, least, codes, maps.size.width, maps.size.height, strength, light,
                             slot);
  });
}

void draw_transmission_worker(Choices& choices, Call& call) {
  const int slot = choices.slot();
  const int stripe = choices.between(0, 9);
  const TransmissionMaps maps = draw_transmission_maps(choices);
  const int strength = draw_strength_q8(choices);
  const int light = choices.between(0, 255);
  const Bytes fill(maps.mean.size(), 0x77);
  Bytes want = fill;
  if (stripe < 8 && !want.empty()) {
    const reference::StripeRows rows = reference::transmission_stripe(maps.size.height, stripe);
    const int first = rows.first * maps.size.width;
    reference::transmission_map_q8(maps.mean.data() + first, maps.least.data() + first,
                                   want.data() + first, maps.size.width, rows.count, strength,
                                   light);
  }
  auto* const mean = call.reads(maps.mean);
  auto* const least = call.reads(maps.least);
  auto* const codes = call.rewrites(fill, want);
  call.before([=] {
    gCalTSrcPreview[slot] = mean;
    gCalTSrc1Preview[slot] = least;
    gCalTDstPreview[slot] = codes;
    gAlpha[slot] = strength;
    gAA[slot] = light;
    gCalTWPreview = maps.size.width;
    gCalTHPreview = maps.size.height;
  });
  call.runs([=] {
    int code = slot * 10 + stripe;
    CalTThreadPreview(&code);
  });
}

void draw_atmospheric_light(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes dark, image, light;
  std::vector<int> histogram;
  if (!nothing) {
    dark = draw_bytes(choices, size.width, size.height);
    image = draw_bytes(choices, 3 * size.width, size.height);
    histogram = reference::histogram_of(dark.data(), size.width * size.height);
    const std::array<uint8_t, 3> want = reference::estimate_light(
        dark.data(), image.data(), histogram.data(), size.width, size.height);
    light.assign(want.begin(), want.end());
  }
  auto* const d = call.reads(dark);
  auto* const img = call.reads(image);
  auto* const hist = call.reads(histogram);
  auto* const a = call.writes(light);
  call.runs([=] { EstimateAPreview(d, img, hist, a, size.width, size.height); });
}

void draw_sampled_sum(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes plane;
  uint32_t sum = 0;
  if (!nothing) {
    plane = draw_bytes(choices, size.width, size.height);
    for (int stripe = 0; stripe < 8; ++stripe)
      sum += reference::sampled_sum(plane.data(), size.width, size.height, stripe);
  }
  auto* const src = call.reads(plane);
  call.returns(static_cast<int>(sum));
  call.runs_for_result([=] { return CalSumThreadPreview(src, size.width, size.height); });
}

void draw_sampled_maxima(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  Bytes h, a;
  Bytes maxima = {0xA5, 0xA5};
  if (!nothing) {
    h = draw_bytes(choices, size.width, size.height);
    a = draw_bytes(choices, size.width, size.height);
    maxima = {0, 0};
    for (int stripe = 0; stripe < 8; ++stripe) {
      const auto most_of = [&](const Bytes& plane) {
        return reference::sampled_maximum(plane.data(), size.width, size.height, stripe);
      };
      if (most_of(h) > maxima[0]) maxima[0] = most_of(h);
      if (most_of(a) > maxima[1]) maxima[1] = most_of(a);
    }
  }
  auto* const plane_h = call.reads(h);
  auto* const plane_a = call.reads(a);
  auto* const out = call.writes(maxima);
  call.runs([=] { CalMaxThreadPreview(plane_h, plane_a, size.width, size.height, out, out + 1); });
}

// One stripe of either statistic, on top of what its cell holds.
void draw_sampled_stripe(Choices& choices, Call& call) {
  const Size size = draw_size(choices);
  const int stripe = choices.between(-1, 9);
  const bool in_thread = choices.one_in(2);
  const Bytes plane = draw_bytes(choices, size.width, size.height);
  std::vector<int> sums = {1, 2, 3, 4, 5, 6, 7, INT_MAX};
  Bytes most = {0, 90, 0, 90, 0, 255, 0, 90};
  const std::vector<int> sums_before = sums;
  const Bytes most_before = most;
  if (stripe >= 0 && stripe < 8) {
    const size_t at = static_cast<size_t>(stripe);
    const uint8_t* const bytes = plane.data();
    sums[at] = static_cast<int>(static_cast<uint32_t>(sums[at]) +
                                reference::sampled_sum(bytes, size.width, size.height, stripe));
    const uint8_t found = reference::sampled_maximum(bytes, size.width, size.height, stripe);
    if (found > most[at]) most[at] = found;
  }
  auto* const src = call.reads(plane);
  call.leaves(gCalSumSum, sums_before, sums);
  call.leaves(gCalMaxMaxH, most_before, most);
  call.leaves(gCalMaxMaxA, most_before, most);
  call.before([=] {
    pCalSumGSrc = gCalMaxpH = gCalMaxpA = src;
    gCalSumWidth = gCalMaxWidth = size.width;
    gCalSumHeight = gCalMaxHeight = size.height;
  });
  call.runs([=] {
    int number = stripe;
    if (in_thread) {
      CalSumThreadIntermate(&number);
      CalMaxPthreadIntermate(&number);
    } else {
      CalSum(stripe);
      CalMax(stripe);
    }
  });
}

void draw_float_transmission(Choices& choices, Call& call) {
  const bool nothing = draws_nothing(choices);
  const Size size = nothing ? draw_empty_size(choices) : draw_size(choices);
  const int level = choices.between(-3, 12);
  Bytes image, light(3);
  for (uint8_t& channel : light) channel = static_cast<uint8_t>(choices.between(1, 255));
  Plane raw, filtered;
  if (!nothing) {
    image = draw_bytes(choices, 3 * size.width, size.height);
    raw = reference::raw_transmission(image.data(), light.data(), size.width, size.height, level);
    filtered = reference::filtered_transmission(raw, size.width, size.height);
  }
  auto* const src = call.reads(image);
  auto* const a = call.reads(light);
  auto* const t = call.writes(filtered);
  auto* const t_raw = call.writes(raw);
  call.runs([=] { EstimateTPreview(src, a, t, t_raw, size.width, size.height, level); });
}

}  // namespace

std::vector<Block> estimate_blocks() {
  return {
      {"CalculateTChannelPreviewNeonFloat", Beside::kAny,
       draw_transmission<CalculateTChannelPreviewNeonFloat, GroupMinimum::kOwn>},
      {"CalculateTChannelPreviewNeon", Beside::kAny,
       draw_transmission<CalculateTChannelPreviewNeon, GroupMinimum::kLowHalfTwice>},
      {"CalculateTChannelPreview", Beside::kOtherSlots, draw_threaded_transmission},
      {"CalTThreadPreview", Beside::kOtherSlots, draw_transmission_worker},
      {"EstimateAPreview", Beside::kAny, draw_atmospheric_light},
      {"CalSumThreadPreview", Beside::kNone, draw_sampled_sum},
      {"CalMaxThreadPreview", Beside::kNone, draw_sampled_maxima},
      {"CalSum, CalMax and their workers", Beside::kNone, draw_sampled_stripe},
      {"EstimateTPreview", Beside::kAny, draw_float_transmission},
  };
}

}  // namespace haze::test
