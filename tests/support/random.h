// A generator of our own (SplitMix64), so that a seed gives the same inputs on every target and
// library.
#pragma once

#include <cstdint>

namespace haze::test {

class Random {
 public:
  explicit Random(uint64_t seed) : state_(seed) {}

  uint64_t next() {
    state_ += 0x9E3779B97F4A7C15u;
    uint64_t z = state_;
    z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9u;
    z = (z ^ (z >> 27)) * 0x94D049BB133111EBu;
    return z ^ (z >> 31);
  }

  uint8_t byte() { return static_cast<uint8_t>(next() >> 56); }

  // Uniform enough for tests: in first ... last, both included.
  int between(int first, int last) {
    const uint64_t span = static_cast<uint64_t>(static_cast<int64_t>(last) - first + 1);
    return static_cast<int>(first + static_cast<int64_t>((next() >> 16) % span));
  }

  template <class T, int count>
  T one_of(const T (&choices)[count]) {
    return choices[between(0, count - 1)];
  }

 private:
  uint64_t state_;
};

// The seed of HAZE_TEST_SEED, or a fixed one; printed when it is first asked for.
uint64_t test_seed();

}  // namespace haze::test
