// What the tool says while it works: one-line notes and, on a terminal, a progress line. All of it
// goes to standard error, because standard output may be the picture pipe.
#ifndef TOOLS_CONSOLE_H
#define TOOLS_CONSOLE_H

#include <string>

namespace dehaze {

class Console {
 public:
  explicit Console(bool quiet);
  ~Console();
  Console(const Console&) = delete;
  Console& operator=(const Console&) = delete;

  // Prints "dehaze: <text>" unless quiet.
  void note(const std::string& text);

  // True if a progress line may be shown: not quiet and standard error is a terminal.
  bool shows_progress() const { return shows_progress_; }
  void show_progress(const std::string& text);
  void clear_progress();

 private:
  bool quiet_;
  bool shows_progress_;
  bool progress_visible_ = false;
};

// Printed whether quiet or not.
void print_error(const std::string& text);

}  // namespace dehaze

#endif  // TOOLS_CONSOLE_H
