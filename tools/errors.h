// What can end a run early. Every message says what to do about it and names the file concerned.
#pragma once

#include <stdexcept>

namespace dehaze {

enum ExitStatus : int {
  kExitDone = 0,
  kExitFailed = 1,
  kExitUsage = 2,
  kExitSignalBase = 128,  // plus the signal's number, as shells report it
};

class Error : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The arguments themselves are wrong, whatever the files hold.
class UsageError : public Error {
 public:
  using Error::Error;
};

// A signal asked the program to stop, or the reader of its pipe went away (SIGPIPE). Silent for the
// latter.
class Interrupted {
 public:
  explicit Interrupted(int signal_number) : signal_number_(signal_number) {}
  int signal_number() const { return signal_number_; }

 private:
  int signal_number_;
};

}  // namespace dehaze
