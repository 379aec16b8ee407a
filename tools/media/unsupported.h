// Kinds of files that people have and that FFmpeg's libraries misread or do not read.
#pragma once

#include <string>

namespace dehaze {

// What the file is and what to do about it; empty if it is of no such kind. By content, camera raw
// files by extension: those are TIFF files whose first picture is a thumbnail.
std::string unsupported_kind(const std::string& path);

}  // namespace dehaze
