// The exported building blocks, each with a way to draw a call of it. The frame path has its own
// tests, as its calls depend on each other.
#pragma once

#include <vector>

#include "tests/surface/call.h"
#include "tests/surface/choices.h"

namespace haze::test {

// What may run at the same time, in calls of equal sizes.
enum class Beside {
  kAny,         // any number of calls
  kOtherSlots,  // calls with distinct slots
  kNone,        // nothing of the same stage
};

struct Block {
  const char* name;
  Beside beside;
  // Draws arguments and contents, and works out the results by the definitions in
  // tests/reference/.
  void (*draw)(Choices& choices, Call& call);
};

std::vector<Block> color_blocks();
std::vector<Block> filter_blocks();
std::vector<Block> estimate_blocks();
std::vector<Block> dark_channel_blocks();
std::vector<Block> recover_blocks();
std::vector<Block> reciprocal_blocks();

// All of them.
std::vector<Block> all_blocks();

// Draws which block, draws a call of it, runs it. Empty if the result is as promised.
std::string run_drawn_block(const std::vector<Block>& blocks, const uint8_t* bytes, size_t count);

}  // namespace haze::test
