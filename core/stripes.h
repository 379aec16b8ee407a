// Worker stripes: one POSIX thread per horizontal stripe of an image.
//
// A stage keeps its pointers in argument globals of eight slots. A worker gets a pointer to an int
// that holds slot * 10 + stripe, so that one pointer tells it both.
//
//   rows      0 .. r-1 | r .. 2r-1 | ...                      | (n-1)r .. height-1
//   thread       0     |     1     | ...                      |        n-1
#pragma once

#include <pthread.h>

namespace haze {

inline constexpr int kSlots = 8;

struct StripeCode {
  int slot;
  int stripe;
};

constexpr int encode_stripe(int slot, int stripe) { return slot * 10 + stripe; }

constexpr StripeCode decode_stripe(int code) { return {code / 10, code % 10}; }

constexpr bool is_slot(int slot) { return slot >= 0 && slot < kSlots; }

// Whether a code names a slot and one of `stripes` stripes.
constexpr bool is_stripe(StripeCode code, int stripes) {
  return is_slot(code.slot) && code.stripe >= 0 && code.stripe < stripes;
}

struct StripeRange {
  int begin;
  int end;
};

// Rows of one stripe: all but the last have height / stripes rows, made even so that no 2 x 2 chroma
// block is split; the last takes what remains. Empty ranges have end <= begin.
constexpr StripeRange even_stripe(int height, int stripes, int stripe) {
  const int rows = height / stripes & ~1;
  const int begin = stripe * rows;
  return {begin, stripe == stripes - 1 ? height : begin + rows};
}

// Runs `worker` on every stripe of `slot`, each on a thread of its own, and returns when all are
// done. Threads start and are joined in stripe order. A stripe whose thread does not start runs here.
template <int kStripes>
void run_stripes(void* (*worker)(void*), int slot) {
  pthread_t threads[kStripes];
  bool started[kStripes];
  int codes[kStripes];
  for (int i = 0; i < kStripes; ++i) {
    codes[i] = encode_stripe(slot, i);
    started[i] = pthread_create(&threads[i], nullptr, worker, &codes[i]) == 0;
    if (!started[i]) worker(&codes[i]);
  }
  for (int i = 0; i < kStripes; ++i)
    if (started[i]) pthread_join(threads[i], nullptr);
}

}  // namespace haze
