// Atmospheric light and strength of a picture or a video, without any output.
#ifndef TOOLS_FIND_LIGHT_H
#define TOOLS_FIND_LIGHT_H

#include "console.h"
#include "media/reader.h"
#include "options.h"
#include "outcome.h"

namespace dehaze {

// Of a video the first second is looked at, or --max-frames.
Outcome find_light(Reader& reader, const Options& options, Console& console);

}  // namespace dehaze

#endif  // TOOLS_FIND_LIGHT_H
