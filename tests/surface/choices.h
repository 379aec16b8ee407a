// Decisions drawn from a string of bytes, so that a fuzzer can make them as well as a generator.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "tests/support/random.h"

namespace haze::test {

class Choices {
 public:
  // `lane` sets callers with the same bytes apart: their sizes are equal, while slots and contents
  // differ. The bytes must outlive the choices; after the last one all choices are the first.
  Choices(const uint8_t* bytes, size_t count, int lane = -1)
      : next_(bytes), end_(bytes + count), lane_(lane) {}

  // In first ... last, both included.
  int between(int first, int last);
  uint8_t byte() { return next_ == end_ ? uint8_t{0} : *next_++; }
  bool one_in(int count) { return between(0, count - 1) == count - 1; }

  template <class T, int count>
  T one_of(const T (&choices)[count]) {
    return choices[between(0, count - 1)];
  }

  // 0 ... 7; that of the lane where there is one.
  int slot();

  // For contents, which would take too many bytes; another one in each lane.
  Random random();

  // Whether callers share these bytes, so that the call may not draw what they cannot share.
  bool has_lane() const { return lane_ >= 0; }

  // Some of the bytes that are left, at most `count`. Lanes get none.
  std::vector<uint8_t> rest(size_t count);

  bool at_end() const { return next_ == end_; }

 private:
  const uint8_t* next_;
  const uint8_t* end_;
  int lane_;
};

// Bytes to decide by.
std::vector<uint8_t> draw_choices(Random& random, size_t count);

}  // namespace haze::test
