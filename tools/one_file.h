// One input to one output.
#pragma once

#include <string>

#include "console.h"
#include "options.h"
#include "outcome.h"

namespace dehaze {

// Whatever goes wrong is in the result; only Interrupted is thrown.
FileResult process_file(const Options& options, Console& console);

// What --timing asks for.
std::string timing_text(const Outcome& outcome);

}  // namespace dehaze
