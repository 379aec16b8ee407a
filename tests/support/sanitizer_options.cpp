// Options that the sanitizers' run times ask a program for: a session opened with a negative size
// must see malloc fail, not the program end; and the comparisons of whole blocks are not to go
// through memcmp byte by byte.
extern "C" {
const char* __asan_default_options();
const char* __tsan_default_options();

const char* __asan_default_options() { return "allocator_may_return_null=1:intercept_memcmp=0"; }
const char* __tsan_default_options() { return "allocator_may_return_null=1"; }
}
