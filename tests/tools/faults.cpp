// Preloaded before the dehaze command, so that calls of the system fail that do not otherwise fail on
// demand. HAZE_TEST_FAULT says which:
//   fork          no process can be started
//   memory        no block of a megabyte or more can be allocated by `new`
//   pipe          no pipe can be made
//   rename-flags  the file system does not know the flags of renameat2()
//   thread-N      the N-th thread cannot be started
#include <dlfcn.h>
#include <pthread.h>
#include <stdio.h>
#include <sys/types.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <new>

namespace {

constexpr size_t kLargeBlock = 1 << 20;

const char* fault() {
  const char* const name = std::getenv("HAZE_TEST_FAULT");
  return name != nullptr ? name : "";
}
bool is_fault(const char* name) { return std::strcmp(fault(), name) == 0; }

int fail(int error) {
  errno = error;
  return -1;
}

template <typename Function>
Function* next(Function*, const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

std::atomic<int> threads_started{0};

}  // namespace

extern "C" {

pid_t fork() noexcept { return is_fault("fork") ? fail(EAGAIN) : next(fork, "fork")(); }

int pipe2(int ends[2], int flags) noexcept {
  return is_fault("pipe") ? fail(EMFILE) : next(pipe2, "pipe2")(ends, flags);
}

int renameat2(int old_folder, const char* old_name, int new_folder, const char* new_name,
              unsigned flags) noexcept {
  if (is_fault("rename-flags") && flags != 0) return fail(EINVAL);
  return next(renameat2, "renameat2")(old_folder, old_name, new_folder, new_name, flags);
}

int pthread_create(pthread_t* thread, const pthread_attr_t* attributes, void* (*start)(void*),
                   void* argument) noexcept {
  constexpr const char* kPrefix = "thread-";
  const size_t length = std::strlen(kPrefix);
  const bool counts = std::strncmp(fault(), kPrefix, length) == 0;
  if (counts && ++threads_started == std::atoi(fault() + length)) return EAGAIN;
  return next(pthread_create, "pthread_create")(thread, attributes, start, argument);
}

}  // extern "C"

void* operator new(size_t bytes) {
  void* const block = bytes >= kLargeBlock && is_fault("memory") ? nullptr : std::malloc(bytes);
  if (block == nullptr) throw std::bad_alloc();
  return block;
}
void operator delete(void* block) noexcept { std::free(block); }
void operator delete(void* block, size_t) noexcept { std::free(block); }
