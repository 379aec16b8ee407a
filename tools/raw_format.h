// Raw 4:2:0 frames: what nothing in the data says and the command line has to.
#pragma once

#include <string>

namespace dehaze {

enum class RawLayout {
  kI420,  // planes Y, U, V
  kYv12,  // planes Y, V, U
  kNv12,  // plane Y, then U, V pairs
  kNv21,  // plane Y, then V, U pairs
};

struct RawFormat {
  int width = 0;
  int height = 0;
  RawLayout layout = RawLayout::kI420;
  // Cameras deliver all 256 values in BT.601. Limited range is taken as in video files.
  bool is_full_range = true;
  int rate_num = 25;  // frames per second
  int rate_den = 1;
};

// "WIDTHxHEIGHT[:LAYOUT][:full|:limited][@RATE]", such as "1280x720:nv21@30" or
// "640x480:limited@30000/1001". Throws UsageError.
RawFormat parse_raw_format(const std::string& text);

// "i420", "yv12", "nv12", "nv21". Throws UsageError.
RawLayout parse_raw_layout(const std::string& text);

}  // namespace dehaze
