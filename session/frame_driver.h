// The per-frame schedule: a full estimate on every second frame, its reuse on the frame between.
#pragma once

#include <stdint.h>

#include "session/stream_state.h"

namespace haze::session {

// Dehazes one frame of the stream in place. Frames outside the limits, or too large for the working
// memory, are left alone together with the stream's state.
void process_frame(StreamState& stream, uint8_t* frame, int width, int height, int level);

}  // namespace haze::session
