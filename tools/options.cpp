#include "options.h"

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <filesystem>
#include <iostream>
#include <limits>
#include <thread>

#include "errors.h"
#include "haze_preview.h"
#include "help.h"

namespace dehaze {
namespace {

constexpr int kMostJobs = 64;
// Every job holds a file in memory; more than this has to be asked for.
constexpr int kMostUsualJobs = 8;
constexpr const char* kMoreHelp = "\nRun with --help for more information.";

int usual_jobs() {
  return std::clamp(static_cast<int>(std::thread::hardware_concurrency()), 1, kMostUsualJobs);
}

// What is decided on after parsing.
struct Words {
  std::vector<std::string> paths;  // INPUT..., and OUTPUT unless there is -o
  std::string output;              // of -o
  std::string raw_input;
  std::string raw_output;
};

void add_file_options(CLI::App& app, Options& options, Words& words) {
  app.add_option("PATH", words.paths, "")->group("");
  app.add_option("-o,--output", words.output,
                 "the output, or the folder for the outputs of several inputs")
      ->type_name("PATH");
  app.add_flag("-f,--force", options.force, "overwrite existing outputs");
  app.add_option("--jobs", options.jobs, "files to work on at the same time")
      ->type_name("N")
      ->check(CLI::Range(1, kMostJobs).description(""))
      ->capture_default_str();
  app.add_flag(
      "--no-recurse", [&options](int64_t) { options.recurse = false; },
      "leave the folders inside a folder alone");
  app.add_option("--max-frames", options.max_frames, "stop a video after N frames")
      ->type_name("N")
      ->check(CLI::Range(int64_t{1}, std::numeric_limits<int64_t>::max()).description(""));
  app.add_option("--raw", words.raw_input,
                 "the input is raw frames: WxH[:i420|yv12|nv12|nv21][:full|:limited][@FPS]")
      ->type_name("FORMAT");
  app.add_option("--raw-output", words.raw_output,
                 "write raw frames to - or .yuv: i420, yv12, nv12 or nv21")
      ->type_name("LAYOUT");
}

void add_message_options(CLI::App& app, Options& options) {
  app.add_flag("-q,--quiet", options.quiet, "no progress and no notes, only errors");
  app.add_flag("--json", options.json, "print one JSON object per file");
  app.add_flag("--timing", options.timing,
               "print the time that the library takes per frame, also with --quiet");
}

// A file whose name begins with a dash is taken for an option.
std::string dash_hint(int argc, char** argv) {
  for (int i = 1; i < argc; ++i) {
    const std::string word = argv[i];
    if (word.size() > 1 && word[0] == '-' && access(argv[i], F_OK) == 0) {
      return "\nFor the file of that name write ./" + word;
    }
  }
  return "";
}

void check_raw_options(const Words& words, Options& options) {
  if (!words.raw_input.empty()) {
    options.raw_input = parse_raw_format(words.raw_input);
    options.raw_output = options.raw_input->layout;
  }
  if (!words.raw_output.empty()) options.raw_output = parse_raw_layout(words.raw_output);
  if (options.is_batch()) {
    if (!words.raw_output.empty()) throw UsageError("--raw-output is for a single output");
    return;
  }
  if (words.raw_output.empty()) return;
  if (options.output != "-" && options.output_kind != OutputKind::kRaw) {
    throw UsageError("--raw-output needs - or a name ending in .yuv as OUTPUT");
  }
  options.output_kind = OutputKind::kRaw;
}

bool is_folder(const std::string& path) {
  std::error_code ignored;
  return std::filesystem::is_directory(path, ignored);
}

bool is_missing(const std::string& path) {
  std::error_code ignored;
  return path != "-" && !std::filesystem::exists(path, ignored) && !ignored;
}

// Decides between one file and a folder of results.
void assign_paths(Words& words, bool output_given, Options& options) {
  const bool light_only = options.engine.show == Show::kLight;
  if (!output_given && words.paths.size() >= 2) {
    if (words.paths.size() > 2) {
      throw UsageError(std::to_string(words.paths.size()) +
                       " names: several inputs need -o FOLDER" + kMoreHelp);
    }
    words.output = words.paths.back();
    words.paths.pop_back();
    output_given = true;
  }
  if (words.paths.empty()) throw UsageError(std::string("INPUT is required") + kMoreHelp);
  if (!output_given && !light_only) {
    throw UsageError(std::string("OUTPUT is required") + kMoreHelp);
  }
  for (const std::string& path : words.paths) {
    if (path.empty()) throw UsageError("the name of the input is empty");
  }
  if (output_given && words.output.empty()) throw UsageError("the name of the output is empty");

  const bool from_folder = std::any_of(words.paths.begin(), words.paths.end(), is_folder);
  const bool is_batch = output_given && (words.paths.size() > 1 || from_folder ||
                                         is_folder(words.output) || words.output.back() == '/');
  if (!is_batch) {
    if (words.paths.size() > 1) throw UsageError("several inputs need -o FOLDER");
    options.input = words.paths.front();
    options.output = words.output;
    if (!output_given) return;
    if (!known_output_kind(words.output) && is_missing(options.input)) {
      throw Error(options.input + ": No such file or directory");
    }
    options.output_kind = output_kind_of(words.output);
    return;
  }
  if (std::find(words.paths.begin(), words.paths.end(), "-") != words.paths.end()) {
    throw UsageError("standard input cannot be one of several inputs");
  }
  if (words.output == "-") throw UsageError("the results of several inputs need -o FOLDER");
  if (!is_folder(words.output) && known_output_kind(words.output)) {
    throw UsageError(
        words.output + ": looks like the name of a file; " + words.paths.front() +
        (from_folder ? " is a folder, and its" : " and the others are several, and their") +
        " results need a folder");
  }
  options.sources = words.paths;
  options.output_folder = words.output;
}

}  // namespace

std::optional<Options> parse_options(int argc, char** argv) {
  Options options;
  options.jobs = usual_jobs();
  Words words;
  CLI::App app(kHelpSummary, "dehaze");
  app.formatter(std::make_shared<HelpFormatter>());
  app.set_help_flag("-h,--help", "print this text");
  app.set_version_flag("--version", std::string("dehaze ") + HAZE_PREVIEW_VERSION_STRING,
                       "print the version");
  add_engine_options(app, options.engine);
  add_file_options(app, options, words);
  add_message_options(app, options);

  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& request) {
    app.exit(request, std::cout, std::cerr);
    return std::nullopt;
  } catch (const CLI::ParseError& error) {
    throw UsageError(std::string(error.what()) + dash_hint(argc, argv) + kMoreHelp);
  }
  check_engine_options(options.engine);
  assign_paths(words, app.get_option("--output")->count() > 0, options);
  check_raw_options(words, options);
  if (options.engine.show == Show::kLight && options.output == "-") {
    throw UsageError("--show light prints to standard output, so that cannot be OUTPUT as well");
  }
  return options;
}

}  // namespace dehaze
