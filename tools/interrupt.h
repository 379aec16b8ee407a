// Signals: the first one asks the run to stop and clean up, a second one removes the unfinished
// file and ends the process at once.
#pragma once

#include <pthread.h>

#include <string>

namespace dehaze {

// SIGINT, SIGTERM and SIGHUP are watched unless the parent had them ignored (nohup, background
// jobs); SIGPIPE is ignored, so that a closed pipe shows up as a failed write. SIGUSR1 does nothing
// but wake threads.
void watch_signals();

// Number of the signal that arrived, 0 if none.
int pending_signal();

void throw_if_interrupted();

// Asks all threads to give up what they wait for, because one of them failed.
void request_stop();

// True after a signal or request_stop().
bool is_stopping();

// Ends a system call that the thread waits in.
void wake_thread(pthread_t thread);

// File that a second signal removes; an empty path means none. One at a time.
void set_unfinished_file(const std::string& path);

}  // namespace dehaze
