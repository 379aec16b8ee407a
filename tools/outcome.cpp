#include "outcome.h"

#include "json.h"

namespace dehaze {
namespace {

const char* name_of(FileStatus status) {
  switch (status) {
    case FileStatus::kDone:
      return "done";
    case FileStatus::kSkipped:
      return "skipped";
    default:
      return "failed";
  }
}

}  // namespace

std::string to_json(const FileResult& result) {
  JsonObject object;
  object.add("input", result.input)
      .add("output", result.output)
      .add("status", name_of(result.status));
  if (!result.message.empty()) object.add("message", result.message);
  if (result.outcome) {
    const HazeFindings& findings = result.outcome->report.findings;
    object.add("width", int64_t{result.outcome->width})
        .add("height", int64_t{result.outcome->height})
        .add("frames", result.outcome->frames)
        .add("seconds", result.seconds)
        .add("strength", findings.strength)
        .add("light",
             std::vector<double>{findings.light_red, findings.light_green, findings.light_blue});
  }
  if (!result.notes.empty()) object.add("notes", result.notes);
  return object.text();
}

}  // namespace dehaze
