// Failures of the functions that the library takes from libc, one call at a time.
#pragma once

namespace haze::test {

// Which calls fail, counted from 0 at the moment of arming.
struct Failing {
  int first = -1;      // -1: none
  bool later = false;  // every one after it as well
  unsigned mask = 0;   // bit k: call k

  bool hits(int call) const {
    const bool marked = call < 32 && (mask >> call & 1u) != 0;
    return marked || call == first || (later && first >= 0 && call > first);
  }
};

struct FaultCounts {
  int allocations;  // calls that ask for memory
  int live;         // blocks that are not given back yet
  int overrun;      // blocks that were written past their end
  int threads;      // calls of pthread_create
  int unjoined;     // threads that have started and are not joined
};

// Between arming and disarming, calls on any thread are counted and fail as told. What the C
// library asks for itself to start a thread does not count.
void arm_faults(Failing allocations, Failing threads);
FaultCounts disarm_faults();

}  // namespace haze::test
