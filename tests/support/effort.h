// How much the tests of drawn calls do.
#pragma once

namespace haze::test {

// The second number under an emulator: qemu-user is slow, and keeps about a megabyte for every
// thread that a program has ever started.
constexpr int effort(int natively, int emulated) {
#ifdef HAZE_TEST_EMULATED
  return (void)natively, emulated;
#else
  return (void)emulated, natively;
#endif
}

}  // namespace haze::test
