// Stripe workers called directly, and slots and codes that name no stripe.
#pragma once

#include <gtest/gtest.h>

#include <climits>
#include <thread>
#include <vector>

namespace haze::test {

constexpr int kSlotCount = 8;

// Multiplying the last one by ten wraps around to a small number.
constexpr int kSlotsOutOfRange[] = {-1, 8, 100, INT_MAX, INT_MIN, -10, 214748365};

// Runs one stripe on this thread, as a caller who filled the globals may.
inline void run_worker(void* (*worker)(void*), int code) {
  int arg = code;
  EXPECT_EQ(worker(&arg), nullptr) << "code " << code;
  EXPECT_EQ(arg, code);
}

// Codes slot * 10 + stripe whose slot or stripe does not exist.
inline std::vector<int> codes_out_of_range(int stripes) {
  std::vector<int> codes = {-1, -7, -10, -13, 80, 83, 87, 100, 1000, INT_MAX, INT_MIN};
  for (int slot = 0; slot < kSlotCount; ++slot)
    for (int stripe = stripes; stripe < 10; ++stripe) codes.push_back(slot * 10 + stripe);
  return codes;
}

// Calls `work(slot)` for all slots on threads of their own.
template <class Work>
void in_all_slots_at_once(const Work& work) {
  std::vector<std::thread> threads;
  for (int slot = 0; slot < kSlotCount; ++slot) threads.emplace_back(work, slot);
  for (std::thread& thread : threads) thread.join();
}

}  // namespace haze::test
