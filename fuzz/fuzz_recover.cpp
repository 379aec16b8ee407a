// Recoveries, brightness lift and zoom.
#include "fuzz/fuzz_blocks.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count) {
  static const std::vector<haze::test::Block> blocks = [] {
    std::vector<haze::test::Block> all = haze::test::recover_blocks();
    for (const haze::test::Block& block : haze::test::reciprocal_blocks()) all.push_back(block);
    return all;
  }();
  return haze::fuzz::run_blocks(blocks, bytes, count);
}
