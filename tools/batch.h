// Several files, several at a time.
#pragma once

#include "errors.h"
#include "options.h"

namespace dehaze {

// Every file is tried, whatever becomes of the others. Returns kExitFailed if one failed.
ExitStatus run_batch(const Options& options);

}  // namespace dehaze
