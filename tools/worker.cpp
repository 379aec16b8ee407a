#include "worker.h"

#include <fcntl.h>
#include <signal.h>
#include <string.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <utility>

#include "console.h"
#include "errors.h"
#include "one_file.h"
#include "show.h"

namespace dehaze {
namespace {

// The words that begin the lines from child to parent.
constexpr const char* kShare = "share ";
constexpr const char* kNote = "note ";
constexpr const char* kInfo = "info ";
constexpr const char* kPrint = "print ";
constexpr const char* kJson = "json ";
constexpr const char* kDone = "done ";
constexpr const char* kFailed = "failed ";

// In the child: sends what a terminal would show.
class WorkerConsole : public Console {
 public:
  WorkerConsole(int descriptor, bool shows_progress)
      : descriptor_(descriptor), shows_progress_(shows_progress) {}

  bool shows_progress() const override { return shows_progress_; }
  void show_progress(const ProgressState& state) override {
    if (state.share >= 0) send(kShare, std::to_string(state.share));
  }
  void clear_progress() override {}

  void send(const char* word, std::string text) const {
    std::replace(text.begin(), text.end(), '\n', ' ');
    text = word + text + "\n";
    for (size_t sent = 0; sent < text.size();) {
      const ssize_t written = write(descriptor_, text.data() + sent, text.size() - sent);
      if (written < 0 && errno != EINTR) return;  // the parent is gone, and so is the reader
      if (written > 0) sent += static_cast<size_t>(written);
    }
  }

 protected:
  void show_note(const std::string& text) override { send(kNote, text); }

 private:
  int descriptor_;
  bool shows_progress_;
};

int work(const Options& options, const WorkerConsole& sender, Console& console) {
  const FileResult result = process_file(options, console);
  if (options.json) sender.send(kJson, to_json(result));
  if (!result.outcome) {
    sender.send(kFailed, result.message);
    return kExitFailed;
  }
  if (options.engine.show == Show::kLight && !options.json) {
    sender.send(kPrint, describe(result.outcome->report.findings));
  }
  if (options.timing) sender.send(kInfo, timing_text(*result.outcome));
  sender.send(kDone, "");
  return kExitDone;
}

[[noreturn]] void run_child(const Options& options, int descriptor, pid_t parent) {
  // Somebody who kills the parent does not want the rest done.
  prctl(PR_SET_PDEATHSIG, SIGTERM);
  if (getppid() != parent) _exit(kExitFailed);
  const int nothing = open("/dev/null", O_RDONLY | O_CLOEXEC);
  if (nothing >= 0) dup2(nothing, STDIN_FILENO);
  WorkerConsole console(descriptor, !options.quiet && isatty(STDERR_FILENO) == 1);
  int status = kExitFailed;
  try {
    status = work(options, console, console);
  } catch (const Interrupted& interrupted) {
    status = kExitSignalBase + interrupted.signal_number();
  } catch (...) {
    // Without a last word; the parent says that it ended early.
  }
  // Not exit(): what the parent has buffered is the parent's.
  std::quick_exit(status);
}

bool take_word(const std::string& line, const char* word, std::string& rest) {
  const size_t length = strlen(word);
  if (line.compare(0, length, word) != 0) return false;
  rest = line.substr(length);
  return true;
}

}  // namespace

Worker::Worker(const Options& options) : input_(options.input) {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0)
    throw Error(std::string("cannot make a pipe: ") + strerror(errno));
  std::fflush(nullptr);
  const pid_t parent = getpid();
  process_ = fork();
  if (process_ == 0) {
    close(ends[0]);
    run_child(options, ends[1], parent);
  }
  const int failure = errno;
  close(ends[1]);
  descriptor_ = ends[0];
  if (process_ < 0) {
    close(descriptor_);
    throw Error(std::string("cannot start a process: ") + strerror(failure));
  }
}

Worker::~Worker() {
  terminate();
  if (process_ > 0) wait();
  close(descriptor_);
}

void Worker::terminate() {
  if (process_ > 0) kill(process_, SIGTERM);
}

bool Worker::receive() {
  char bytes[4096];
  const ssize_t count = read(descriptor_, bytes, sizeof(bytes));
  if (count < 0) return errno == EINTR || errno == EAGAIN;
  if (count == 0) {
    wait();
    return false;
  }
  received_.append(bytes, static_cast<size_t>(count));
  for (size_t end = received_.find('\n'); end != std::string::npos; end = received_.find('\n')) {
    handle(received_.substr(0, end));
    received_.erase(0, end + 1);
  }
  return true;
}

void Worker::handle(const std::string& line) {
  std::string rest;
  if (take_word(line, kShare, rest)) {
    share_ = std::clamp(std::atof(rest.c_str()), 0.0, 1.0);
  } else if (take_word(line, kNote, rest)) {
    notes_.push_back(rest);
  } else if (take_word(line, kInfo, rest)) {
    infos_.push_back(rest);
  } else if (take_word(line, kPrint, rest)) {
    output_.push_back(rest);
  } else if (take_word(line, kJson, rest)) {
    json_ = rest;
  } else if (take_word(line, kDone, rest)) {
    is_done_ = true;
  } else if (take_word(line, kFailed, rest)) {
    failure_ = rest;
  }
}

void Worker::wait() {
  int status = 0;
  while (waitpid(process_, &status, 0) < 0 && errno == EINTR) {
  }
  process_ = -1;
  if (is_done_ || !failure_.empty()) return;
  failure_ = input_ + ": its process ended early";
  if (WIFSIGNALED(status)) failure_ += std::string(", ") + strsignal(WTERMSIG(status));
}

std::vector<std::string> Worker::take_notes() { return std::exchange(notes_, {}); }
std::vector<std::string> Worker::take_infos() { return std::exchange(infos_, {}); }
std::vector<std::string> Worker::take_output() { return std::exchange(output_, {}); }

}  // namespace dehaze
