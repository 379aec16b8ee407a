// Video in, video out.
#ifndef TOOLS_DEHAZE_VIDEO_H
#define TOOLS_DEHAZE_VIDEO_H

#include "console.h"
#include "media/reader.h"
#include "options.h"
#include "outcome.h"

namespace dehaze {

Outcome dehaze_video(Reader& reader, const Options& options, Console& console);

}  // namespace dehaze

#endif  // TOOLS_DEHAZE_VIDEO_H
