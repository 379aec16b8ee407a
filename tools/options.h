// The command line.
#ifndef TOOLS_OPTIONS_H
#define TOOLS_OPTIONS_H

#include <cstdint>
#include <optional>
#include <string>

#include "engine_options.h"

namespace dehaze {

enum class OutputKind { kJpeg, kPng, kWebp, kMp4, kMov, kMkv, kY4m };

inline bool is_picture_kind(OutputKind kind) {
  return kind == OutputKind::kJpeg || kind == OutputKind::kPng || kind == OutputKind::kWebp;
}

struct Options {
  std::string input;   // "-": Y4M on standard input
  std::string output;  // "-": Y4M on standard output; empty: only the light is printed
  OutputKind output_kind = OutputKind::kY4m;
  EngineOptions engine;
  int64_t max_frames = 0;  // 0: all
  bool quiet = false;
  bool force = false;
  bool timing = false;
};

// Kind by file extension, whatever its case; "-" is Y4M. Throws UsageError for any other.
OutputKind output_kind_of(const std::string& path);

// Empty if the text asked for (help, version) has been printed and there is nothing to do. Throws
// UsageError.
std::optional<Options> parse_options(int argc, char** argv);

}  // namespace dehaze

#endif  // TOOLS_OPTIONS_H
