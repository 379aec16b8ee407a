// What the tool says while it works: notes, and on a terminal a progress line. On standard error,
// because standard output may be the picture pipe.
#pragma once

#include <string>
#include <vector>

namespace dehaze {

// How far a file is.
struct ProgressState {
  double share;      // 0 ... 1, negative if unknown
  std::string text;  // "120/300 frames, 40 %, ..."
};

class Console {
 public:
  Console() = default;
  virtual ~Console() = default;
  Console(const Console&) = delete;
  Console& operator=(const Console&) = delete;

  void note(const std::string& text) {
    notes_.push_back(text);
    show_note(text);
  }
  // All notes so far, shown or not.
  const std::vector<std::string>& notes() const { return notes_; }

  // False if states would be thrown away.
  virtual bool shows_progress() const = 0;
  virtual void show_progress(const ProgressState& state) = 0;
  virtual void clear_progress() = 0;

 protected:
  virtual void show_note(const std::string& text) = 0;

 private:
  std::vector<std::string> notes_;
};

class TerminalConsole : public Console {
 public:
  explicit TerminalConsole(bool quiet);
  ~TerminalConsole() override;

  bool shows_progress() const override { return shows_progress_; }
  void show_progress(const ProgressState& state) override;
  void clear_progress() override;

 protected:
  void show_note(const std::string& text) override;

 private:
  bool quiet_;
  bool shows_progress_;  // not quiet, and standard error is a terminal
  bool progress_visible_ = false;
};

// Printed whether quiet or not; on a terminal the name of the program is red, unless NO_COLOR is
// set.
void print_error(const std::string& text);

// A line to standard error, not subject to --quiet either.
void print_info(const std::string& text);

}  // namespace dehaze
