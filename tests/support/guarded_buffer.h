// Buffers that end exactly where the contract says.
#pragma once

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <vector>

#include "tests/support/guarded_bytes.h"

namespace haze::test {

// Filled with one byte value, so that an unwritten element shows. What lies around it is checked by
// intact() and at the end, or by the processor: see default_placement().
template <class T>
class GuardedBuffer {
 public:
  // `skew` bytes in front take the data off the allocation's alignment (byte buffers only).
  explicit GuardedBuffer(size_t count, uint8_t fill = 0, size_t skew = 0)
      : count_(count), bytes_(count * sizeof(T), default_placement(), skew) {
    if (count != 0) std::memset(bytes_.data(), fill, bytes());
  }
  explicit GuardedBuffer(const std::vector<T>& content, size_t skew = 0)
      : GuardedBuffer(content.size(), 0, skew) {
    if (!content.empty()) std::memcpy(bytes_.data(), content.data(), bytes());
  }
  GuardedBuffer(const GuardedBuffer&) = delete;
  GuardedBuffer& operator=(const GuardedBuffer&) = delete;
  ~GuardedBuffer() {
    EXPECT_TRUE(intact()) << "bytes outside a buffer of " << bytes() << " bytes were written";
  }

  T* data() { return reinterpret_cast<T*>(bytes_.data()); }
  const T* data() const { return reinterpret_cast<const T*>(bytes_.data()); }
  size_t size() const { return count_; }
  size_t bytes() const { return count_ * sizeof(T); }
  T& operator[](size_t i) { return data()[i]; }
  const T& operator[](size_t i) const { return data()[i]; }

  bool intact() const { return bytes_.intact(); }

 private:
  size_t count_;
  GuardedBytes bytes_;
};

// Ends at a page that may not be touched in every mode of the tests, so that a read past the end
// stops the program on every target.
template <class T>
class PageEndBuffer {
 public:
  explicit PageEndBuffer(size_t count)
      : count_(count), bytes_(count * sizeof(T), Placement::kPageEnd) {}
  explicit PageEndBuffer(const std::vector<T>& content) : PageEndBuffer(content.size()) {
    if (!content.empty()) std::memcpy(bytes_.data(), content.data(), content.size() * sizeof(T));
  }

  T* data() { return reinterpret_cast<T*>(bytes_.data()); }
  const T* data() const { return reinterpret_cast<const T*>(bytes_.data()); }
  size_t size() const { return count_; }

 private:
  size_t count_;
  GuardedBytes bytes_;
};

}  // namespace haze::test
