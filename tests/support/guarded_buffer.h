// Buffers that end exactly where the contract says.
#ifndef HAZE_TESTS_SUPPORT_GUARDED_BUFFER_H
#define HAZE_TESTS_SUPPORT_GUARDED_BUFFER_H

#include <gtest/gtest.h>
#include <sys/mman.h>
#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <vector>

namespace haze::test {

#if defined(__SANITIZE_ADDRESS__)
#define HAZE_TEST_ADDRESS_SANITIZER 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define HAZE_TEST_ADDRESS_SANITIZER 1
#endif
#endif

// Bytes that must keep their value on either side of a buffer. The address sanitizer has red zones
// of its own, which see reads as well, so there the allocation itself is exact.
#ifdef HAZE_TEST_ADDRESS_SANITIZER
constexpr size_t kCanaryBytes = 0;
#else
constexpr size_t kCanaryBytes = 64;
#endif

// Filled with one byte value, so that an unwritten element shows; canaries are checked by intact()
// and at the end.
template <class T>
class GuardedBuffer {
 public:
  // `skew` bytes in front take the data off the allocation's alignment (byte buffers only).
  explicit GuardedBuffer(size_t count, uint8_t fill = 0, size_t skew = 0)
      : count_(count),
        lead_(kCanaryBytes + skew),
        storage_(static_cast<uint8_t*>(std::malloc(lead_ + bytes() + kCanaryBytes))) {
    if (storage_ == nullptr) std::abort();
    std::memset(storage_, kCanary, lead_ + bytes() + kCanaryBytes);
    std::memset(storage_ + lead_, fill, bytes());
  }
  explicit GuardedBuffer(const std::vector<T>& content, size_t skew = 0)
      : GuardedBuffer(content.size(), 0, skew) {
    if (!content.empty()) std::memcpy(storage_ + lead_, content.data(), bytes());
  }
  GuardedBuffer(const GuardedBuffer&) = delete;
  GuardedBuffer& operator=(const GuardedBuffer&) = delete;
  ~GuardedBuffer() {
    EXPECT_TRUE(intact()) << "bytes outside a buffer of " << bytes() << " bytes were written";
    std::free(storage_);
  }

  T* data() { return reinterpret_cast<T*>(storage_ + lead_); }
  const T* data() const { return reinterpret_cast<const T*>(storage_ + lead_); }
  size_t size() const { return count_; }
  size_t bytes() const { return count_ * sizeof(T); }
  T& operator[](size_t i) { return data()[i]; }
  const T& operator[](size_t i) const { return data()[i]; }

  bool intact() const {
    for (size_t i = 0; i < lead_; ++i)
      if (storage_[i] != kCanary) return false;
    for (size_t i = 0; i < kCanaryBytes; ++i)
      if (storage_[lead_ + bytes() + i] != kCanary) return false;
    return true;
  }

 private:
  static constexpr uint8_t kCanary = 0xC7;

  size_t count_;
  size_t lead_;
  uint8_t* storage_;
};

// Ends at a page that may not be touched, so that a read past the end stops the program on every
// target.
template <class T>
class PageEndBuffer {
 public:
  explicit PageEndBuffer(size_t count) : count_(count) {
    const size_t page = static_cast<size_t>(sysconf(_SC_PAGESIZE));
    const size_t usable = (count * sizeof(T) + page - 1) / page * page;
    mapped_ = usable + page;
    void* base = mmap(nullptr, mapped_, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    if (base == MAP_FAILED) std::abort();
    base_ = static_cast<uint8_t*>(base);
    if (mprotect(base_ + usable, page, PROT_NONE) != 0) std::abort();
    data_ = reinterpret_cast<T*>(base_ + usable - count * sizeof(T));
  }
  explicit PageEndBuffer(const std::vector<T>& content) : PageEndBuffer(content.size()) {
    if (!content.empty()) std::memcpy(data_, content.data(), content.size() * sizeof(T));
  }
  PageEndBuffer(const PageEndBuffer&) = delete;
  PageEndBuffer& operator=(const PageEndBuffer&) = delete;
  ~PageEndBuffer() { munmap(base_, mapped_); }

  T* data() { return data_; }
  const T* data() const { return data_; }
  size_t size() const { return count_; }

 private:
  size_t count_;
  size_t mapped_ = 0;
  uint8_t* base_ = nullptr;
  T* data_ = nullptr;
};

}  // namespace haze::test

#endif
