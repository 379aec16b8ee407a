// The command line.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "engine_options.h"
#include "output_kind.h"
#include "raw_format.h"

namespace dehaze {

struct Options {
  // One file: input and output. Several or a folder: sources and output_folder.
  std::string input;   // "-": standard input
  std::string output;  // "-": standard output; empty: only the light is printed
  OutputKind output_kind = OutputKind::kY4m;
  std::vector<std::string> sources;
  std::string output_folder;

  EngineOptions engine;
  int64_t max_frames = 0;              // 0: all
  std::optional<RawFormat> raw_input;  // none: the content tells
  RawLayout raw_output = RawLayout::kI420;
  int jobs = 1;  // files at a time
  bool recurse = true;
  bool quiet = false;
  bool force = false;
  bool timing = false;
  bool json = false;

  bool is_batch() const { return !output_folder.empty(); }
  bool is_light_only() const { return !is_batch() && output.empty(); }
};

// Empty if the text asked for (help, version) has been printed and there is nothing to do. Throws
// UsageError; an Error if a folder is in the way.
std::optional<Options> parse_options(int argc, char** argv);

}  // namespace dehaze
