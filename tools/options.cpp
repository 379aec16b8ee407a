#include "options.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cctype>
#include <filesystem>
#include <iostream>
#include <limits>

#include "errors.h"
#include "haze_preview.h"

namespace dehaze {
namespace {

constexpr char kExamples[] =
    "Examples:\n"
    "  dehaze hazy.jpg clear.jpg\n"
    "  dehaze --strength 40 --max-frames 250 drive.mp4 trial.mp4\n"
    "  dehaze --show compare hazy.jpg before_after.png\n"
    "  ffmpeg -i drive.mp4 -f yuv4mpegpipe - | dehaze - - | ffplay -\n"
    "\n"
    "Exit status: 0 done, 1 failed, 2 wrong usage, 128 + n stopped by signal n.";

}  // namespace

OutputKind output_kind_of(const std::string& path) {
  if (path == "-") return OutputKind::kY4m;
  std::string extension = std::filesystem::path(path).extension().string();
  std::transform(extension.begin(), extension.end(), extension.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  if (extension == ".jpg" || extension == ".jpeg") return OutputKind::kJpeg;
  if (extension == ".png") return OutputKind::kPng;
  if (extension == ".webp") return OutputKind::kWebp;
  if (extension == ".mp4") return OutputKind::kMp4;
  if (extension == ".mov") return OutputKind::kMov;
  if (extension == ".mkv") return OutputKind::kMkv;
  if (extension == ".y4m") return OutputKind::kY4m;
  throw UsageError(path +
                   ": unknown kind of output; use .jpg .jpeg .png .webp (picture), .mp4 .mkv .mov "
                   ".y4m (video) or - (Y4M on standard output)");
}

std::optional<Options> parse_options(int argc, char** argv) {
  Options options;
  CLI::App app("Takes haze, fog and smog out of a picture or a video.", "dehaze");
  app.set_version_flag("--version", std::string("dehaze ") + HAZE_PREVIEW_VERSION_STRING);
  app.add_option("INPUT", options.input, "picture or video, or - for Y4M on standard input")
      ->type_name("")
      ->required();
  const CLI::Option* output =
      app.add_option(
             "OUTPUT", options.output,
             "picture (.jpg .png .webp), video (.mp4 .mkv .mov .y4m), or - for Y4M on standard "
             "output")
          ->type_name("");
  add_engine_options(app, options.engine);
  app.add_option("--max-frames", options.max_frames, "stop a video after N frames")
      ->type_name("N")
      ->check(CLI::Range(int64_t{1}, std::numeric_limits<int64_t>::max()).description(""));
  app.add_flag("--quiet", options.quiet, "no progress and no notes, only errors");
  app.add_flag("--force", options.force, "overwrite an existing output");
  app.add_flag("--timing", options.timing,
               "print the time that the library takes per frame, also with --quiet");
  app.footer(kExamples);

  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& request) {
    app.exit(request, std::cout, std::cerr);
    return std::nullopt;
  } catch (const CLI::ParseError& error) {
    throw UsageError(std::string(error.what()) + "\nRun with --help for more information.");
  }
  if (options.input.empty()) throw UsageError("the name of the input is empty");
  check_engine_options(options.engine);
  if (output->count() > 0) {
    if (options.output.empty()) throw UsageError("the name of the output is empty");
    options.output_kind = output_kind_of(options.output);
  } else if (options.engine.show != Show::kLight) {
    throw UsageError("OUTPUT is required\nRun with --help for more information.");
  }
  if (options.engine.show == Show::kLight && options.output == "-") {
    throw UsageError("--show light prints to standard output, so that cannot be OUTPUT as well");
  }
  return options;
}

}  // namespace dehaze
