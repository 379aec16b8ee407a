// Calls of building blocks with arguments from a fuzzer's bytes, against the references.
#pragma once

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "fuzz/level.h"
#include "tests/surface/blocks.h"

namespace haze::fuzz {

// The first byte names the level of the vector paths, the rest is for the call.
inline int run_blocks(const std::vector<test::Block>& blocks, const uint8_t* bytes, size_t count) {
  if (count == 0) return 0;
  choose_level(bytes[0]);
  const std::string difference = test::run_drawn_block(blocks, bytes + 1, count - 1);
  if (difference.empty()) return 0;
  std::fprintf(stderr, "%s\n", difference.c_str());
  std::abort();
}

}  // namespace haze::fuzz
