// Several files, several at a time.
#ifndef TOOLS_BATCH_H
#define TOOLS_BATCH_H

#include "errors.h"
#include "options.h"

namespace dehaze {

// Every file is tried, whatever becomes of the others. Returns kExitFailed if one failed.
ExitStatus run_batch(const Options& options);

}  // namespace dehaze

#endif  // TOOLS_BATCH_H
