// The command line of `dehaze report`.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "engine_options.h"
#include "raw_format.h"

namespace dehaze {

struct ReportOptions {
  std::string input;      // "-": standard input
  std::string output;     // the page
  std::string reference;  // the same scene without haze; empty: none
  EngineOptions engine;
  int64_t max_frames = 0;              // 0: all
  std::optional<RawFormat> raw_input;  // none: the content tells
  bool quiet = false;
  bool force = false;
};

// True if the first word after the name of the program asks for a report. A file of that name can
// be given as ./report.
bool asks_for_report(int argc, char** argv);

// Takes the words from "report" on. Empty if the help has been printed and there is nothing to do.
// Throws UsageError.
std::optional<ReportOptions> parse_report_options(int argc, char** argv);

}  // namespace dehaze
