// Linked into programs whose coverage is measured: processes that end by quick_exit() write their
// counts as well.
#include <cstdlib>

extern "C" void __gcov_dump();

namespace {

[[gnu::constructor]] void count_quick_exits() { std::at_quick_exit(__gcov_dump); }

}  // namespace
