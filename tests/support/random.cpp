#include "tests/support/random.h"

#include <cinttypes>
#include <cstdio>
#include <cstdlib>

namespace haze::test {

uint64_t test_seed() {
  static const uint64_t seed = [] {
    const char* text = std::getenv("HAZE_TEST_SEED");
    const uint64_t value = text != nullptr ? std::strtoull(text, nullptr, 0) : 20090620u;
    std::printf("HAZE_TEST_SEED=%" PRIu64 "\n", value);
    return value;
  }();
  return seed;
}

}  // namespace haze::test
