// Which files of several inputs and folders become which outputs.
#pragma once

#include <string>
#include <vector>

#include "options.h"

namespace dehaze {

struct PlannedFile {
  std::string input;
  std::string output;
  bool is_done_already = false;  // the output exists and may stay
  std::string failure;           // why it cannot be processed
};

struct BatchPlan {
  std::vector<PlannedFile> files;  // in the order of the inputs, folders sorted by name
  int others = 0;                  // files in folders that are no pictures or videos by their names
};

// A result lies where its input lies below the folder that was named, under the same name; formats
// that cannot be written become .png, .mp4 or .mkv. Folders are searched with all that they hold,
// except for hidden names, links to folders and the output folder itself.
BatchPlan plan_batch(const Options& options);

}  // namespace dehaze
