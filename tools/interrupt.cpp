#include "interrupt.h"

#include <limits.h>
#include <signal.h>
#include <string.h>
#include <unistd.h>

#include <atomic>

#include "errors.h"

namespace dehaze {
namespace {

volatile sig_atomic_t received_signal = 0;

// Read by the handler, so a plain array. `unfinished_file_set` is cleared while the array changes.
char unfinished_file[PATH_MAX];
volatile sig_atomic_t unfinished_file_set = 0;

void on_signal(int number) {
  if (received_signal != 0) {
    if (unfinished_file_set != 0) unlink(unfinished_file);
    _exit(kExitSignalBase + number);
  }
  received_signal = number;
}

void do_nothing(int) {}

std::atomic<bool> stop_requested{false};

}  // namespace

void watch_signals() {
  struct sigaction action = {};
  action.sa_handler = on_signal;
  // No SA_RESTART: a read that waits for a pipe has to return.
  for (const int number : {SIGINT, SIGTERM, SIGHUP}) {
    struct sigaction previous = {};
    if (sigaction(number, nullptr, &previous) == 0 && previous.sa_handler == SIG_IGN) continue;
    sigaction(number, &action, nullptr);
  }
  signal(SIGPIPE, SIG_IGN);
  action.sa_handler = do_nothing;
  sigaction(SIGUSR1, &action, nullptr);
}

int pending_signal() { return received_signal; }

void request_stop() { stop_requested = true; }

bool is_stopping() { return received_signal != 0 || stop_requested; }

void wake_thread(pthread_t thread) { pthread_kill(thread, SIGUSR1); }

void throw_if_interrupted() {
  if (received_signal != 0) throw Interrupted(received_signal);
}

void set_unfinished_file(const std::string& path) {
  unfinished_file_set = 0;
  if (path.empty() || path.size() >= sizeof(unfinished_file)) return;
  memcpy(unfinished_file, path.c_str(), path.size() + 1);
  unfinished_file_set = 1;
}

}  // namespace dehaze
