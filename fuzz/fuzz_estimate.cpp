// Transmission maps, dark channel, atmospheric light, minimum and maximum filters.
#include "fuzz/fuzz_blocks.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count) {
  static const std::vector<haze::test::Block> blocks = [] {
    std::vector<haze::test::Block> all = haze::test::estimate_blocks();
    for (const haze::test::Block& block : haze::test::dark_channel_blocks()) all.push_back(block);
    return all;
  }();
  return haze::fuzz::run_blocks(blocks, bytes, count);
}
