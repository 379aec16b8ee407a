#include "tests/surface/draw.h"

#include <algorithm>
#include <climits>

#include "tests/support/moods.h"

namespace haze::test {
namespace {

int draw_side(Choices& choices, int least, int most) {
  return choices.between(least, std::max(least, most));
}

}  // namespace

Size draw_size(Choices& choices, int least) {
  switch (choices.between(0, 7)) {
    case 0:
      return {draw_side(choices, least, 1400), draw_side(choices, least, 4)};
    case 1:
      return {draw_side(choices, least, 4), draw_side(choices, least, 800)};
    case 2:
      return {draw_side(choices, least, 200), draw_side(choices, least, 100)};
    default:
      return {draw_side(choices, least, least + 60), draw_side(choices, least, least + 30)};
  }
}

Size draw_even_size(Choices& choices) {
  const Size blocks = draw_size(choices);
  return {2 * blocks.width, 2 * blocks.height};
}

Size draw_empty_size(Choices& choices) {
  const int sides[] = {0, -1, -2, -8, -640, INT_MIN};
  const int empty = choices.one_of(sides);
  const int other = choices.between(-4, 40);
  return choices.one_in(2) ? Size{empty, other} : Size{other, empty};
}

Size draw_size_without_blocks(Choices& choices) {
  if (choices.one_in(2)) return draw_empty_size(choices);
  const int odd = 2 * choices.between(0, 40) + 1;
  const int other = choices.between(1, 40);
  return choices.one_in(2) ? Size{odd, other} : Size{other, odd};
}

bool draws_nothing(Choices& choices) { return choices.one_in(12); }

int draw_slot(Choices& choices, bool& is_slot) {
  is_slot = choices.has_lane() || !choices.one_in(16);
  if (is_slot) return choices.slot();
  const int others[] = {-1, 8, 9, 100, INT_MAX, INT_MIN, -10, 214748365};
  return choices.one_of(others);
}

std::vector<uint8_t> draw_bytes(Choices& choices, int width, int height) {
  const bool own = choices.one_in(4);
  if (own) {
    const size_t count = static_cast<size_t>(width) * static_cast<size_t>(height);
    const std::vector<uint8_t> pattern = choices.rest(count);
    if (!pattern.empty()) {
      std::vector<uint8_t> bytes(count);
      for (size_t i = 0; i < count; ++i) bytes[i] = pattern[i % pattern.size()];
      return bytes;
    }
  }
  const Mood mood = choices.one_of(kMoods);
  Random random = choices.random();
  return make_image(random, mood, width, height);
}

std::vector<float> draw_plane(Choices& choices, Size size) {
  const FloatMood mood = choices.one_of(kFloatMoods);
  Random random = choices.random();
  return make_plane(random, mood, size.width, size.height);
}

}  // namespace haze::test
