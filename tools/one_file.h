// One input to one output.
#ifndef TOOLS_ONE_FILE_H
#define TOOLS_ONE_FILE_H

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

#endif  // TOOLS_ONE_FILE_H
