// dehaze: takes haze, fog and smog out of pictures and videos.
#include <unistd.h>

#include <csignal>
#include <exception>
#include <new>
#include <optional>
#include <string>

#include "console.h"
#include "dehaze_picture.h"
#include "dehaze_video.h"
#include "errors.h"
#include "interrupt.h"
#include "media/av_error.h"
#include "media/reader.h"
#include "options.h"
#include "output_file.h"

namespace dehaze {
namespace {

void run(const Options& options) {
  if (options.output != "-") {
    check_output_path(options.input, options.output, options.force);
  } else if (isatty(STDOUT_FILENO)) {
    throw UsageError("standard output is a terminal; send the Y4M stream to a file or a program");
  }
  Console console(options.quiet);
  Reader reader(options.input);
  FrameTimes times;
  if (is_picture_kind(options.output_kind)) {
    if (!reader.is_picture()) {
      console.note("the input is a video; its first frame becomes the picture");
    }
    times = dehaze_picture(reader, options, console);
  } else if (reader.is_picture()) {
    throw Error(reader.path() +
                ": a picture cannot become a video; name the output .jpg, .png or .webp");
  } else {
    times = dehaze_video(reader, options, console);
  }
  console.clear_progress();
  // Asked for by name, so not subject to --quiet.
  if (options.timing) print_error("time per frame: " + describe(times));
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
