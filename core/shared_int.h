// The sizes that a threaded stage keeps in globals, one for all of its slots.
//
// Concurrent calls of a stage have equal sizes, so that each may store them while the workers of
// another read: the value stays what it is. Access is atomic all the same, as plain stores beside
// loads are a race to the language whatever they store. Relaxed order is enough, since a worker's
// own caller has stored the same value before it started the thread, and costs nothing: these are
// plain loads and stores on every target.
#pragma once

namespace haze {

inline int load_shared(const int& global) { return __atomic_load_n(&global, __ATOMIC_RELAXED); }

inline void store_shared(int& global, int value) {
  __atomic_store_n(&global, value, __ATOMIC_RELAXED);
}

}  // namespace haze
