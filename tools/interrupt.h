// Signals: the first one asks the run to stop and clean up, a second one removes the unfinished
// file and ends the process at once.
#ifndef TOOLS_INTERRUPT_H
#define TOOLS_INTERRUPT_H

#include <string>

namespace dehaze {

// SIGINT, SIGTERM and SIGHUP are watched unless the parent had them ignored (nohup, background
// jobs); SIGPIPE is ignored, so that a closed pipe shows up as a failed write.
void watch_signals();

// Number of the signal that arrived, 0 if none.
int pending_signal();

void throw_if_interrupted();

// File that a second signal removes; an empty path means none. One at a time.
void set_unfinished_file(const std::string& path);

}  // namespace dehaze

#endif  // TOOLS_INTERRUPT_H
