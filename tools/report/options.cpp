#include "report/options.h"

#include <CLI/CLI.hpp>
#include <cstring>
#include <iostream>
#include <limits>
#include <memory>
#include <vector>

#include "errors.h"
#include "help.h"
#include "output_kind.h"

namespace dehaze {
namespace {

constexpr const char* kSummary =
    "Writes a page that shows what the haze removal does to a picture or a video.";
constexpr const char* kExamples =
    "Examples:\n"
    "  dehaze report hazy.jpg -o report.html\n"
    "  dehaze report --engine photo --max-frames 250 drive.mp4 -o report.html\n"
    "  dehaze report hazy.png --reference clear.png -o report.html\n"
    "\n"
    "Usage: dehaze report [OPTIONS] INPUT -o PAGE.html\n"
    "\n"
    "  INPUT   a picture, a video, or - for Y4M on standard input\n"
    "  PAGE    one file that needs nothing else: open it in a browser, send it, print it\n";
constexpr const char* kMoreHelp = "\nRun dehaze report --help for more information.";

class ReportHelp : public HelpFormatter {
 public:
  std::string make_help(const CLI::App* app, std::string, CLI::AppFormatMode mode) const override {
    return std::string(kSummary) + "\n\n" + kExamples + make_groups(app, mode);
  }
};

// What is decided on after parsing.
struct Words {
  std::vector<std::string> paths;  // INPUT, and PAGE unless there is -o
  std::string raw_input;
};

void add_options(CLI::App& app, ReportOptions& options, Words& words) {
  add_engine_options(app, options.engine);
  app.remove_option(app.get_option("--show"));  // a report shows everything
  app.add_option("PATH", words.paths, "")->group("");
  app.add_option("-o,--output", options.output, "the page, named .html")->type_name("PAGE");
  app.add_option("--reference", options.reference,
                 "the same picture or video without haze, of the same size: adds how close the "
                 "result comes to it")
      ->type_name("CLEAR");
  app.add_flag("-f,--force", options.force, "overwrite an existing page");
  app.add_option("--max-frames", options.max_frames, "stop after N frames of a video")
      ->type_name("N")
      ->check(CLI::Range(int64_t{1}, std::numeric_limits<int64_t>::max()).description(""));
  app.add_option("--raw", words.raw_input,
                 "the input is raw frames: WxH[:i420|yv12|nv12|nv21][:full|:limited][@FPS]")
      ->type_name("FORMAT");
  app.add_flag("-q,--quiet", options.quiet, "no progress and no notes, only errors");
}

void check_names(Words& words, bool output_given, ReportOptions& options) {
  if (!output_given && words.paths.size() == 2) {
    options.output = words.paths.back();
    words.paths.pop_back();
    output_given = true;
  }
  if (words.paths.empty()) throw UsageError(std::string("INPUT is required") + kMoreHelp);
  if (words.paths.size() > 1) throw UsageError("a report is about one picture or video");
  if (!output_given) throw UsageError(std::string("-o PAGE.html is required") + kMoreHelp);
  options.input = words.paths.front();
  if (options.input.empty()) throw UsageError("the name of the input is empty");
  const std::string extension = extension_of(options.output);
  if (extension != ".html" && extension != ".htm") {
    throw UsageError(options.output + ": a report is a page; give it a name ending in .html");
  }
}

}  // namespace

bool asks_for_report(int argc, char** argv) {
  return argc > 1 && std::strcmp(argv[1], "report") == 0;
}

std::optional<ReportOptions> parse_report_options(int argc, char** argv) {
  ReportOptions options;
  Words words;
  CLI::App app(kSummary, "dehaze report");
  app.formatter(std::make_shared<ReportHelp>());
  app.set_help_flag("-h,--help", "print this text");
  add_options(app, options, words);
  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& request) {
    app.exit(request, std::cout, std::cerr);
    return std::nullopt;
  } catch (const CLI::ParseError& error) {
    throw UsageError(std::string(error.what()) + kMoreHelp);
  }
  check_engine_options(options.engine);
  check_names(words, app.get_option("--output")->count() > 0, options);
  if (app.get_option("--reference")->count() > 0 && options.reference.empty()) {
    throw UsageError("the name of the reference is empty");
  }
  if (!words.raw_input.empty()) options.raw_input = parse_raw_format(words.raw_input);
  return options;
}

}  // namespace dehaze
