#include "tests/support/guarded_bytes.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace haze::test {
namespace {

#if defined(__SANITIZE_ADDRESS__)
#define HAZE_TEST_ADDRESS_SANITIZER 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define HAZE_TEST_ADDRESS_SANITIZER 1
#endif
#endif

// The address sanitizer has red zones of its own, which see reads as well, so there the allocation
// itself is exact.
#ifdef HAZE_TEST_ADDRESS_SANITIZER
constexpr size_t kCanaryBytes = 0;
#else
constexpr size_t kCanaryBytes = 64;
#endif
constexpr uint8_t kCanary = 0xC7;

[[noreturn]] void fail(const char* what) {
  std::perror(what);
  std::abort();
}

}  // namespace

Placement default_placement() {
  static const Placement placement = [] {
    const char* const mode = std::getenv("HAZE_TEST_GUARD_PAGES");
    if (mode == nullptr || *mode == '\0') return Placement::kHeap;
    if (std::strcmp(mode, "start") == 0) return Placement::kPageStart;
    if (std::strcmp(mode, "end") == 0) return Placement::kPageEnd;
    std::fprintf(stderr, "HAZE_TEST_GUARD_PAGES must be start or end, not %s\n", mode);
    std::abort();
  }();
  return placement;
}

GuardedBytes::GuardedBytes(size_t size, Placement placement, size_t skew) : size_(size) {
  if (placement == Placement::kHeap)
    place_on_heap(skew);
  else
    place_in_pages(placement, skew);
  std::fill(first_, data_, kCanary);
  std::fill(data_ + size_, end_, kCanary);
}

void GuardedBytes::place_on_heap(size_t skew) {
  const size_t lead = kCanaryBytes + skew;
  first_ = static_cast<uint8_t*>(std::malloc(lead + size_ + kCanaryBytes));
  if (first_ == nullptr) fail("malloc");
  data_ = first_ + lead;
  end_ = data_ + size_ + kCanaryBytes;
}

void GuardedBytes::place_in_pages(Placement placement, size_t skew) {
  const size_t page = static_cast<size_t>(sysconf(_SC_PAGESIZE));
  const size_t usable = (size_ + skew + page - 1) / page * page;
  mapped_ = usable + 2 * page;
  void* const mapping =
      mmap(nullptr, mapped_, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
  if (mapping == MAP_FAILED) fail("mmap");
  mapping_ = static_cast<uint8_t*>(mapping);
  first_ = mapping_ + page;
  end_ = first_ + usable;
  if (usable != 0 && mprotect(first_, usable, PROT_READ | PROT_WRITE) != 0) fail("mprotect");
  data_ = placement == Placement::kPageStart ? first_ + skew : end_ - size_;
}

GuardedBytes::~GuardedBytes() {
  if (mapping_ != nullptr)
    munmap(mapping_, mapped_);
  else
    std::free(first_);
}

bool GuardedBytes::intact() const {
  const auto is_canary = [](uint8_t byte) { return byte == kCanary; };
  return std::all_of<const uint8_t*>(first_, data_, is_canary) &&
         std::all_of<const uint8_t*>(data_ + size_, end_, is_canary);
}

}  // namespace haze::test
