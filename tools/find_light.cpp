#include "find_light.h"

#include <algorithm>
#include <cmath>

#include "errors.h"
#include "frame_path.h"

namespace dehaze {

Outcome find_light(Reader& reader, const Options& options, Console& console) {
  const FramePtr frame = make_frame();
  if (!reader.read_frame(frame.get())) throw Error(reader.path() + ": holds no picture");
  const Source source = source_of(reader, *frame);
  FramePath path(*frame, source, options.engine, console);
  const int64_t first_second = std::max<int64_t>(1, std::llround(source.frames_per_second));
  const int64_t limit = options.max_frames > 0 ? options.max_frames : first_second;
  int64_t frames = 0;
  do {
    path.run(*frame);
  } while (++frames < limit && !reader.is_picture() && reader.read_frame(frame.get()));
  return {path.engine().report(), path.size().visible_width, path.size().visible_height, frames};
}

}  // namespace dehaze
