// One operation at one size, beside its yardsticks.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

namespace haze::bench {

using Bytes = std::vector<uint8_t>;

// Sizes of frames; the half-resolution images are half of it in both directions.
struct Size {
  int width;
  int height;
};

struct Case {
  std::string operation;
  Size size;                      // of the image that the operation works on
  std::function<void()> run;      // the library's function
  std::function<Bytes()> output;  // what run() left, compared between the CPU levels
  std::string peer_name;          // empty if there is none
  std::function<void()> peer;     // the best general-purpose function for the same work
  Size frame = {};                // that it belongs to; none for the threaded stages
};

// Each appends the cases of one folder for a frame of this size.
void add_frame_cases(Size frame, std::vector<Case>& cases);
void add_color_cases(Size frame, std::vector<Case>& cases);
void add_filter_cases(Size frame, std::vector<Case>& cases);
void add_estimate_cases(Size frame, std::vector<Case>& cases);
void add_recover_cases(Size frame, std::vector<Case>& cases);

// Stages with threads at sizes of their own; their peer is the same work on one thread.
void add_thread_cases(std::vector<Case>& cases);

}  // namespace haze::bench
