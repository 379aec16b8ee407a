// What came of a file.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "engine.h"
#include "errors.h"

namespace dehaze {

// Of a file that was processed to its end.
struct Outcome {
  RunReport report;
  int width = 0;  // of the output
  int height = 0;
  int64_t frames = 0;
};

enum class FileStatus { kDone, kSkipped, kFailed };

struct FileResult {
  std::string input;
  std::string output;
  FileStatus status = FileStatus::kFailed;
  ExitStatus exit_status = kExitFailed;  // that this file alone would give
  std::string message;                   // why it was skipped or failed
  std::vector<std::string> notes;
  std::optional<Outcome> outcome;  // if it was done
  double seconds = 0;
};

// The line that --json prints: README.md has its members.
std::string to_json(const FileResult& result);

}  // namespace dehaze
