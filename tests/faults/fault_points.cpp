// Stands in for libc's allocators and thread functions, for the library as well: a symbol of the
// program comes before that of a library.
#include "tests/faults/fault_points.h"

#include <dlfcn.h>
#include <errno.h>
#include <pthread.h>
#include <stddef.h>
#include <stdint.h>
#include <stdlib.h>
#include <string.h>

#include <atomic>

// The C library's own names for its allocator.
extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* block, size_t size);
void* __libc_memalign(size_t alignment, size_t size);
void __libc_free(void* block);
}

namespace haze::test {
namespace {

constexpr int kMostBlocks = 256;

std::atomic<bool> armed;
std::atomic<int> allocations;
std::atomic<int> threads;
std::atomic<int> unjoined;
std::atomic<int> overrun;
Failing failing_allocations;
Failing failing_threads;
thread_local bool starting_thread;

// A block that was handed out while armed, with a canary behind it.
struct Block {
  std::atomic<void*> address;
  std::atomic<size_t> size;
};
Block blocks[kMostBlocks];
constexpr size_t kCanaryBytes = 16;
constexpr unsigned char kCanary = 0xC7;

unsigned char* canary_of(void* block, size_t size) {
  return static_cast<unsigned char*>(block) + size;
}

void remember(void* block, size_t size) {
  memset(canary_of(block, size), kCanary, kCanaryBytes);
  for (Block& entry : blocks) {
    void* none = nullptr;
    if (!entry.address.compare_exchange_strong(none, block)) continue;
    entry.size = size;
    return;
  }
  abort();
}

void forget(void* block) {
  for (Block& entry : blocks) {
    const size_t size = entry.size;
    void* expected = block;
    if (!entry.address.compare_exchange_strong(expected, nullptr)) continue;
    const unsigned char* const canary = canary_of(block, size);
    for (size_t i = 0; i < kCanaryBytes; ++i)
      if (canary[i] != kCanary) {
        ++overrun;
        return;
      }
    return;
  }
}

// `allocate` is given the number of bytes to ask for.
template <class Allocate>
void* counted(size_t size, const Allocate& allocate) {
  if (!armed || starting_thread) return allocate(size);
  if (failing_allocations.hits(allocations++)) {
    errno = ENOMEM;
    return nullptr;
  }
  if (size > SIZE_MAX - kCanaryBytes) return nullptr;
  void* const block = allocate(size + kCanaryBytes);
  if (block != nullptr) remember(block, size);
  return block;
}

template <class Function>
Function real(const char* name) {
  return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

}  // namespace

void arm_faults(Failing failing_allocation_calls, Failing failing_thread_calls) {
  failing_allocations = failing_allocation_calls;
  failing_threads = failing_thread_calls;
  allocations = threads = unjoined = overrun = 0;
  for (Block& entry : blocks) entry.address = nullptr;
  armed = true;
}

FaultCounts disarm_faults() {
  armed = false;
  FaultCounts counts = {allocations, 0, overrun, threads, unjoined};
  for (const Block& entry : blocks) counts.live += entry.address != nullptr;
  return counts;
}

}  // namespace haze::test

extern "C" {

void* malloc(size_t size) {
  return haze::test::counted(size, [](size_t bytes) { return __libc_malloc(bytes); });
}

void* calloc(size_t count, size_t size) {
  if (size != 0 && count > SIZE_MAX / size) return nullptr;
  return haze::test::counted(count * size, [](size_t bytes) { return __libc_calloc(bytes, 1); });
}

void* realloc(void* block, size_t size) {
  return haze::test::counted(size, [=](size_t bytes) {
    haze::test::forget(block);
    return __libc_realloc(block, bytes);
  });
}

void* memalign(size_t alignment, size_t size) {
  return haze::test::counted(size, [=](size_t bytes) { return __libc_memalign(alignment, bytes); });
}

void* aligned_alloc(size_t alignment, size_t size) { return memalign(alignment, size); }

int posix_memalign(void** block, size_t alignment, size_t size) {
  *block = memalign(alignment, size);
  return *block == nullptr ? ENOMEM : 0;
}

void free(void* block) {
  if (block != nullptr && haze::test::armed) haze::test::forget(block);
  __libc_free(block);
}

int pthread_create(pthread_t* thread, const pthread_attr_t* attributes, void* (*start)(void*),
                   void* argument) {
  using Create = int (*)(pthread_t*, const pthread_attr_t*, void* (*)(void*), void*);
  static const Create create = haze::test::real<Create>("pthread_create");
  if (haze::test::armed && haze::test::failing_threads.hits(haze::test::threads++)) return EAGAIN;
  haze::test::starting_thread = true;
  const int result = create(thread, attributes, start, argument);
  haze::test::starting_thread = false;
  if (haze::test::armed && result == 0) ++haze::test::unjoined;
  return result;
}

int pthread_join(pthread_t thread, void** value) {
  using Join = int (*)(pthread_t, void**);
  static const Join join = haze::test::real<Join>("pthread_join");
  const int result = join(thread, value);
  if (haze::test::armed && result == 0) --haze::test::unjoined;
  return result;
}

}  // extern "C"
