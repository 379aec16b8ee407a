// Titles, dates, languages and the like, from one container to another.
#pragma once

#include "media/ffmpeg_handles.h"

namespace dehaze {

// Both leave out what describes the old file rather than its content.
void copy_container_metadata(const AVFormatContext& from, AVFormatContext& to);
void copy_stream_metadata(const AVStream& from, AVStream& to);

// Chapters with their titles, moved to an output that begins at `start` of the input and ends
// `length` later at the latest (both in AV_TIME_BASE units).
void copy_chapters(const AVFormatContext& from, AVFormatContext& to, int64_t start, int64_t length);

}  // namespace dehaze
