// dehaze: takes haze, fog and smog out of pictures and videos.
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <exception>
#include <new>
#include <optional>
#include <string>

#include "console.h"
#include "dehaze_picture.h"
#include "dehaze_video.h"
#include "errors.h"
#include "find_light.h"
#include "interrupt.h"
#include "media/av_error.h"
#include "media/reader.h"
#include "options.h"
#include "output_file.h"
#include "show.h"

namespace dehaze {
namespace {

bool is_light_only(const Options& options) { return options.output.empty(); }

void run(const Options& options) {
  if (is_light_only(options)) {
    // Nothing is written.
  } else if (options.output != "-") {
    check_output_path(options.input, options.output, options.force);
  } else if (isatty(STDOUT_FILENO)) {
    throw UsageError("standard output is a terminal; send the Y4M stream to a file or a program");
  }
  Console console(options.quiet);
  Reader reader(options.input);
  RunReport report;
  if (is_light_only(options)) {
    report = find_light(reader, options, console);
  } else if (is_picture_kind(options.output_kind)) {
    if (!reader.is_picture()) {
      console.note("the input is a video; its first frame becomes the picture");
    }
    report = dehaze_picture(reader, options, console);
  } else if (reader.is_picture()) {
    throw Error(reader.path() +
                ": a picture cannot become a video; name the output .jpg, .png or .webp");
  } else {
    report = dehaze_video(reader, options, console);
  }
  console.clear_progress();
  if (options.engine.show == Show::kLight) std::puts(describe(report.findings).c_str());
  // Asked for by name, so not subject to --quiet.
  if (options.timing) print_error("time per frame: " + describe(report.times));
}

int guarded_main(int argc, char** argv) {
  try {
    watch_signals();
    capture_av_log();
    const std::optional<Options> options = parse_options(argc, argv);
    if (options) run(*options);
    return kExitDone;
  } catch (const Interrupted& interrupted) {
    const int number = interrupted.signal_number();
    if (number != SIGPIPE) print_error("interrupted; no output file was left behind");
    return kExitSignalBase + number;
  } catch (const UsageError& error) {
    print_error(error.what());
    return kExitUsage;
  } catch (const std::bad_alloc&) {
    print_error("not enough memory");
  } catch (const std::exception& error) {
    print_error(error.what());
  }
  return kExitFailed;
}

}  // namespace
}  // namespace dehaze

int main(int argc, char** argv) { return dehaze::guarded_main(argc, argv); }
