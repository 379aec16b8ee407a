// One picture in, one picture out.
#pragma once

#include "console.h"
#include "media/reader.h"
#include "options.h"
#include "outcome.h"

namespace dehaze {

// Of a video the first frame is taken. The picture comes out upright and without an orientation
// tag. A single frame is always an estimate frame.
Outcome dehaze_picture(Reader& reader, const Options& options, Console& console);

}  // namespace dehaze
