#include "console.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>

namespace dehaze {
namespace {

constexpr size_t kUsualColumns = 80;

size_t terminal_columns() {
  struct winsize size = {};
  if (ioctl(STDERR_FILENO, TIOCGWINSZ, &size) != 0 || size.ws_col == 0) return kUsualColumns;
  return size.ws_col;
}

// A line that wrapped could not be overwritten.
std::string fit(const std::string& text, size_t columns) {
  size_t end = 0;
  for (size_t used = 0; end < text.size(); ++end) {
    // Bytes that continue a UTF-8 character (10xxxxxx) take no column of their own.
    if ((static_cast<unsigned char>(text[end]) & 0xC0) == 0x80) continue;
    if (++used > columns) break;
  }
  return text.substr(0, end);
}

// As https://no-color.org has it: set and not empty, whatever the value.
bool has_color() {
  const char* const no_color = std::getenv("NO_COLOR");
  const char* const terminal = std::getenv("TERM");
  return isatty(STDERR_FILENO) == 1 && (no_color == nullptr || *no_color == '\0') &&
         (terminal == nullptr || std::string(terminal) != "dumb");
}

}  // namespace

TerminalConsole::TerminalConsole(bool quiet)
    : quiet_(quiet), shows_progress_(!quiet && isatty(STDERR_FILENO) == 1) {}

TerminalConsole::~TerminalConsole() { TerminalConsole::clear_progress(); }

void TerminalConsole::show_note(const std::string& text) {
  if (quiet_) return;
  clear_progress();
  print_info(text);
}

void TerminalConsole::show_progress(const ProgressState& state) {
  if (!shows_progress_) return;
  // "\033[K" clears what a longer line left behind.
  std::fprintf(stderr, "\r%s\033[K", fit(state.text, terminal_columns() - 1).c_str());
  std::fflush(stderr);
  progress_visible_ = true;
}

void TerminalConsole::clear_progress() {
  if (!progress_visible_) return;
  std::fputs("\r\033[K", stderr);
  std::fflush(stderr);
  progress_visible_ = false;
}

void print_error(const std::string& text) {
  const char* const name = has_color() ? "\033[31mdehaze:\033[0m" : "dehaze:";
  std::fprintf(stderr, "%s %s\n", name, text.c_str());
}

void print_info(const std::string& text) { std::fprintf(stderr, "dehaze: %s\n", text.c_str()); }

}  // namespace dehaze
