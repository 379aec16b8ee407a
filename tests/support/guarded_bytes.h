// Memory whose surroundings are watched.
#pragma once

#include <cstddef>
#include <cstdint>

namespace haze::test {

// Where a block lies, and what is on either side of it.
enum class Placement {
  kHeap,       // of its exact size, between bytes that are checked for changes
  kPageStart,  // right behind a page that may not be touched; such a page follows, too
  kPageEnd,    // right before one; such a page lies in front, too
};

// The placement of the tests' buffers: kHeap, or what HAZE_TEST_GUARD_PAGES (start or end) says.
Placement default_placement();

class GuardedBytes {
 public:
  // `skew` bytes in front of the block take it off its alignment. Right before a guard page it is
  // the size that decides on the alignment.
  GuardedBytes(size_t size, Placement placement, size_t skew = 0);
  ~GuardedBytes();
  GuardedBytes(const GuardedBytes&) = delete;
  GuardedBytes& operator=(const GuardedBytes&) = delete;

  uint8_t* data() { return data_; }
  const uint8_t* data() const { return data_; }
  size_t size() const { return size_; }

  // Whether the bytes on either side, as far as they may be written, are as they were.
  bool intact() const;

 private:
  void place_on_heap(size_t skew);
  void place_in_pages(Placement placement, size_t skew);

  size_t size_;
  uint8_t* data_ = nullptr;
  uint8_t* first_ = nullptr;  // of the bytes that may be accessed
  uint8_t* end_ = nullptr;
  uint8_t* mapping_ = nullptr;  // null on the heap
  size_t mapped_ = 0;
};

}  // namespace haze::test
