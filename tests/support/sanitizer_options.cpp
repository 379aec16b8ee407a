// Options that the sanitizers' run times ask a program for: a session opened with a negative size
// must see malloc fail, not the program end; and the comparisons of whole blocks are not to go
// through memcmp byte by byte. Leaks are looked for by ptrace, which qemu-user does not have, and
// its addresses are too few for a large quarantine.
#ifdef HAZE_TEST_EMULATED
#define HAZE_TEST_OPTIONS ":detect_leaks=0:quarantine_size_mb=16:thread_local_quarantine_size_kb=64"
#else
#define HAZE_TEST_OPTIONS ""
#endif

extern "C" {
const char* __asan_default_options();
const char* __tsan_default_options();

const char* __asan_default_options() {
  return "allocator_may_return_null=1:intercept_memcmp=0" HAZE_TEST_OPTIONS;
}
const char* __tsan_default_options() { return "allocator_may_return_null=1"; }
}
