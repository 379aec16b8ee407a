// Atmospheric light and strength of a picture or a video, without any output.
#pragma once

#include "console.h"
#include "media/reader.h"
#include "options.h"
#include "outcome.h"

namespace dehaze {

// Of a video the first second is looked at, or --max-frames.
Outcome find_light(Reader& reader, const Options& options, Console& console);

}  // namespace dehaze
