// Sessions and frames in any order, in and out of the limits, beside the reference's session.
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "fuzz/level.h"
#include "tests/support/moods.h"
#include "tests/support/session_pair.h"
#include "tests/surface/choices.h"
#include "tests/surface/draw.h"

namespace haze::fuzz {
namespace {

using test::Choices;
using test::Random;
using test::SessionPair;
using test::Size;

constexpr int kMostSteps = 12;
constexpr int kMostBlockBytes = 4 << 20;

int draw_format(Choices& choices) {
  const int formats[] = {0, 3, 3, 1, 2, 4, -1, INT_MAX, INT_MIN};
  return choices.one_of(formats);
}

// Sizes to open a session with: usual ones, and any whose product may wrap.
Size draw_session_size(Choices& choices) {
  if (!choices.one_in(3)) return {choices.between(100, 300), choices.between(100, 300)};
  const int odd[] = {0, 1, -1, -128, 128, 1280, 720, 16384, 32768, 65536, INT_MAX, INT_MIN};
  return {choices.one_of(odd), choices.one_of(odd)};
}

// Large blocks would only take time.
bool asks_for_much(Size size) {
  const uint64_t pixels = static_cast<uint64_t>(int64_t{size.width} * size.height);
  return static_cast<int32_t>(static_cast<uint32_t>(pixels * 4)) > kMostBlockBytes;
}

Size draw_frame_size(Choices& choices) {
  switch (choices.between(0, 15)) {
    case 0: {
      const Size odd[] = {{1280, 720}, {1282, 128},        {128, 722},     {127, 128},
                          {128, 127},  {126, 126},         {0, 0},         {-128, 128},
                          {128, -128}, {INT_MIN, INT_MIN}, {65536, 65536}, {INT_MAX, INT_MAX}};
      return choices.one_of(odd);
    }
    case 1:
      return {choices.between(120, 140), choices.between(120, 140)};
    case 2:
      return {2 * choices.between(64, 320), 128};
    default:
      return {2 * choices.between(64, 80), 2 * choices.between(64, 80)};
  }
}

std::vector<uint8_t> draw_frame(Choices& choices, Size size) {
  const bool hazy = choices.one_in(3);
  const bool muted = choices.one_in(2);
  if (!hazy && choices.one_in(3)) return test::draw_bytes(choices, size.width, size.height / 2 * 3);
  const test::Mood mood = choices.one_of(test::kMoods);
  Random random = choices.random();
  if (hazy) return make_hazy_frame(random, size.width, size.height);
  return make_frame(random, mood, muted ? test::Colours::kMuted : test::Colours::kWild, size.width,
                    size.height);
}

void run_frame(Choices& choices, SessionPair& sessions) {
  const Size size = draw_frame_size(choices);
  const int levels[] = {-50, 0, 1, 40, 100, 117, 250, INT_MAX, INT_MIN};
  const int level = choices.one_in(4) ? choices.between(-300, 300) : choices.one_of(levels);
  // A frame that is refused may not be touched at all, so it needs no bytes.
  std::vector<uint8_t> frame;
  if (sessions.reference().accepts(size.width, size.height)) frame = draw_frame(choices, size);
  sessions.remove_haze(frame, size.width, size.height, level, choices.between(-5, 5));
}

void run_step(Choices& choices, SessionPair& sessions) {
  switch (choices.between(0, 9)) {
    case 0:
      return sessions.release();
    case 1:
    case 2: {
      const Size size = draw_session_size(choices);
      const int format = draw_format(choices);
      if (!asks_for_much(size)) sessions.init(format, size.width, size.height);
      return;
    }
    case 3: {
      const int numbers[] = {0, 1, 2, -1, INT_MAX, INT_MIN};
      return sessions.set_frame_number(choices.one_of(numbers));
    }
    case 4:
      if (sessions.reference().open || !choices.one_in(8)) return;
      return sessions.supply_block(std::vector<uint8_t>(1280 * 720 * 4, choices.byte()));
    default:
      return run_frame(choices, sessions);
  }
}

}  // namespace
}  // namespace haze::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count) {
  // The comparisons are GoogleTest's; the first that fails ends the program.
  ::testing::GTEST_FLAG(break_on_failure) = true;
  if (count == 0) return 0;
  haze::fuzz::choose_level(bytes[0]);
  haze::test::Choices choices(bytes + 1, count - 1);
  haze::test::SessionPair sessions;
  for (int step = 0; step < haze::fuzz::kMostSteps && !choices.at_end(); ++step)
    haze::fuzz::run_step(choices, sessions);
  return 0;
}
