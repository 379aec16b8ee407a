#include "tests/surface/blocks.h"

namespace haze::test {

std::vector<Block> all_blocks() {
  std::vector<Block> all;
  for (const auto& part : {color_blocks(), filter_blocks(), estimate_blocks(),
                           dark_channel_blocks(), recover_blocks(), reciprocal_blocks()})
    all.insert(all.end(), part.begin(), part.end());
  return all;
}

std::string run_drawn_block(const std::vector<Block>& blocks, const uint8_t* bytes, size_t count) {
  constexpr Placement kPlacements[] = {Placement::kPageEnd, Placement::kPageStart,
                                       Placement::kHeap};
  Choices choices(bytes, count);
  const Block& block =
      blocks[static_cast<size_t>(choices.between(0, static_cast<int>(blocks.size()) - 1))];
  Call call(choices.one_of(kPlacements));
  block.draw(choices, call);
  call.prepare();
  call.run();
  const std::string difference = call.difference();
  return difference.empty() ? difference : std::string(block.name) + ": " + difference;
}

}  // namespace haze::test
