// Stands in for libc's allocators and thread functions, for the library as well: a symbol of the
// program comes before that of a library.
#include "tests/faults/fault_points.h"

#include <dlfcn.h>
#include <errno.h>
#include <pthread.h>
#include <stddef.h>
#include <stdlib.h>

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
// Blocks that were handed out while armed.
std::atomic<void*> blocks[kMostBlocks];
Failing failing_allocations;
Failing failing_threads;
thread_local bool starting_thread;

void remember(void* block) {
  for (std::atomic<void*>& entry : blocks) {
    void* none = nullptr;
    if (entry.compare_exchange_strong(none, block)) return;
  }
  abort();
}

void forget(void* block) {
  for (std::atomic<void*>& entry : blocks) {
    void* expected = block;
    if (entry.compare_exchange_strong(expected, nullptr)) return;
  }
}

template <class Allocate>
void* counted(const Allocate& allocate) {
  if (!armed || starting_thread) return allocate();
  if (failing_allocations.hits(allocations++)) {
    errno = ENOMEM;
    return nullptr;
  }
  void* const block = allocate();
  if (block != nullptr) remember(block);
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
  allocations = threads = unjoined = 0;
  for (std::atomic<void*>& entry : blocks) entry = nullptr;
  armed = true;
}

FaultCounts disarm_faults() {
  armed = false;
  FaultCounts counts = {allocations, 0, threads, unjoined};
  for (const std::atomic<void*>& entry : blocks) counts.live += entry != nullptr;
  return counts;
}

}  // namespace haze::test

extern "C" {

void* malloc(size_t size) {
  return haze::test::counted([=] { return __libc_malloc(size); });
}

void* calloc(size_t count, size_t size) {
  return haze::test::counted([=] { return __libc_calloc(count, size); });
}

void* realloc(void* block, size_t size) {
  return haze::test::counted([=] {
    haze::test::forget(block);
    return __libc_realloc(block, size);
  });
}

void* memalign(size_t alignment, size_t size) {
  return haze::test::counted([=] { return __libc_memalign(alignment, size); });
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
