#include "console.h"

#include <unistd.h>

#include <cstdio>

namespace dehaze {

Console::Console(bool quiet)
    : quiet_(quiet), shows_progress_(!quiet && isatty(STDERR_FILENO) == 1) {}

Console::~Console() { clear_progress(); }

void Console::note(const std::string& text) {
  if (quiet_) return;
  clear_progress();
  std::fprintf(stderr, "dehaze: %s\n", text.c_str());
}

void Console::show_progress(const std::string& text) {
  if (!shows_progress_) return;
  // "\033[K" clears what a longer line left behind.
  std::fprintf(stderr, "\r%s\033[K", text.c_str());
  std::fflush(stderr);
  progress_visible_ = true;
}

void Console::clear_progress() {
  if (!progress_visible_) return;
  std::fputs("\r\033[K", stderr);
  std::fflush(stderr);
  progress_visible_ = false;
}

void print_error(const std::string& text) { std::fprintf(stderr, "dehaze: %s\n", text.c_str()); }

}  // namespace dehaze
