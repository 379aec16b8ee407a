// Threads that cannot be started: the caller computes their stripes.
#include <dlfcn.h>
#include <errno.h>
#include <gtest/gtest.h>
#include <pthread.h>

#include <cstdint>
#include <vector>

#include "haze_preview.h"

namespace {

// Bit k makes the k-th call of pthread_create fail.
unsigned failing_calls = 0;
int calls = 0;

}  // namespace

// Takes the place of libc's function for the library as well.
extern "C" int pthread_create(pthread_t* thread, const pthread_attr_t* attributes,
                              void* (*start)(void*), void* argument) {
  using Create = int (*)(pthread_t*, const pthread_attr_t*, void* (*)(void*), void*);
  static const Create real = reinterpret_cast<Create>(dlsym(RTLD_NEXT, "pthread_create"));
  const int call = calls++;
  if (failing_calls >> call & 1u) return EAGAIN;
  return real(thread, attributes, start, argument);
}

namespace {

constexpr int kWidth = 37;
constexpr int kHeight = 50;

std::vector<uint8_t> transmission_with_failures(unsigned failures) {
  std::vector<uint8_t> mean(kWidth * kHeight);
  std::vector<uint8_t> minimum(mean.size());
  for (size_t i = 0; i < mean.size(); ++i) {
    mean[i] = static_cast<uint8_t>(i * 7);
    minimum[i] = static_cast<uint8_t>(i * 13 + 5);
  }
  std::vector<uint8_t> codes(mean.size(), 0xEE);
  failing_calls = failures;
  calls = 0;
  CalculateTChannelPreview(mean.data(), minimum.data(), codes.data(), kWidth, kHeight, 256, 255, 3);
  failing_calls = 0;
  return codes;
}

TEST(ThreadStart, TransmissionIsTheSameWhicheverThreadsFail) {
  const std::vector<uint8_t> expected = transmission_with_failures(0);
  EXPECT_EQ(calls, 8);
  for (unsigned failures = 1; failures < 256; ++failures) {
    EXPECT_EQ(transmission_with_failures(failures), expected) << "failing calls " << failures;
    EXPECT_EQ(calls, 8);
  }
}

TEST(ThreadStart, AFailedStartIsNotJoined) {
  // Joining a thread that was never started would crash or hang.
  EXPECT_EQ(transmission_with_failures(255), transmission_with_failures(0));
}

}  // namespace
