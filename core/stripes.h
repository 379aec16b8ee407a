// Worker stripes: one POSIX thread per stripe of an image.
//
// A stage keeps its pointers in argument globals of eight slots. A worker gets a pointer to an int
// that holds slot * 10 + stripe, so that one pointer tells it both.
//
//   rows      0 .. r-1 | r .. 2r-1 | ...                      | (n-1)r .. height-1
//   thread       0     |     1     | ...                      |        n-1
#pragma once

#include <pthread.h>
#include <stddef.h>

#include "core/image_size.h"

namespace haze {

inline constexpr int kSlots = 8;

struct StripeCode {
  int slot;
  int stripe;
};

constexpr int encode_stripe(int slot, int stripe) { return slot * 10 + stripe; }

constexpr StripeCode decode_stripe(int code) { return {code / 10, code % 10}; }

// The code that a worker's argument points at.
inline StripeCode decode_stripe(const void* arg) {
  return decode_stripe(*static_cast<const int*>(arg));
}

constexpr bool is_slot(int slot) { return slot >= 0 && slot < kSlots; }

// Whether a code names a slot and one of `stripes` stripes.
constexpr bool is_stripe(StripeCode code, int stripes) {
  return is_slot(code.slot) && code.stripe >= 0 && code.stripe < stripes;
}

// Empty where end <= begin.
struct StripeRange {
  int begin;
  int end;
};

// Rows (or columns) of one stripe of `size`: all but the last have size / stripes, made even so
// that no 2 x 2 chroma block is split; the last takes what remains. Nothing of a size below 1.
constexpr StripeRange even_stripe(int size, int stripes, int stripe) {
  if (size < 1) return {0, 0};
  const int length = size / stripes & ~1;
  const int begin = stripe * length;
  return {begin, stripe == stripes - 1 ? size : begin + length};
}

// The pixels of a range of rows of a packed image; none if the width or the range is empty.
struct PixelRange {
  size_t begin;
  size_t count;

  constexpr PixelRange(StripeRange rows, int width)
      : begin(pixel_count(width, rows.begin)), count(pixel_count(width, rows.end - rows.begin)) {}
};

// Runs `worker` on each stripe of `slot`, each on a thread of its own, and returns when all are
// done: the result of joining the last one, 0. Threads start and are joined in stripe order. A
// stripe whose thread does not start runs here.
template <int kStripes>
int run_stripes(void* (*worker)(void*), int slot) {
  pthread_t threads[kStripes];
  bool started[kStripes];
  int codes[kStripes];
  for (int i = 0; i < kStripes; ++i) {
    codes[i] = encode_stripe(slot, i);
    started[i] = pthread_create(&threads[i], nullptr, worker, &codes[i]) == 0;
    if (!started[i]) worker(&codes[i]);
  }
  int joined = 0;
  for (int i = 0; i < kStripes; ++i) joined = started[i] ? pthread_join(threads[i], nullptr) : 0;
  return joined;
}

}  // namespace haze
