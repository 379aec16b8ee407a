// Video in, video out.
#pragma once

#include "console.h"
#include "media/reader.h"
#include "options.h"
#include "outcome.h"

namespace dehaze {

Outcome dehaze_video(Reader& reader, const Options& options, Console& console);

}  // namespace dehaze
