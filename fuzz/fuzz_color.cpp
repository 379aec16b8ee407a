// Channel extraction, colour conversions and channel maps.
#include "fuzz/fuzz_blocks.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count) {
  static const std::vector<haze::test::Block> blocks = haze::test::color_blocks();
  return haze::fuzz::run_blocks(blocks, bytes, count);
}
