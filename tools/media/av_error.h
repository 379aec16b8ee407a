// Errors of FFmpeg's libraries: result codes become exceptions, log lines become their detail.
#pragma once

#include <cstdint>
#include <string>

namespace dehaze {

// Takes over the libraries' log: nothing is printed, the last error line is kept.
void capture_av_log();

// Errors that demultiplexers have logged so far. Some of them meet a file that breaks off, log it
// and then report an ordinary end of file.
int64_t demuxer_errors_logged();

// The last logged error line without its end, empty if there is none. Taking it clears it.
std::string take_last_logged_error();

// Returns `result` if it is not negative. Otherwise throws Error with "<what>: <reason>", or
// Interrupted if a signal made the call give up.
int check(int result, const std::string& what);

}  // namespace dehaze
