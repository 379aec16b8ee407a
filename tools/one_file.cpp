#include "one_file.h"

#include <unistd.h>

#include <chrono>
#include <exception>
#include <new>

#include "dehaze_picture.h"
#include "dehaze_video.h"
#include "errors.h"
#include "find_light.h"
#include "media/reader.h"
#include "output_file.h"

namespace dehaze {
namespace {

void check_output(const Options& options) {
  if (options.is_light_only()) return;
  if (options.output != "-") {
    check_output_path(options.input, options.output, options.force);
  } else if (isatty(STDOUT_FILENO)) {
    throw UsageError("standard output is a terminal; send the stream to a file or a program");
  }
}

Outcome process(const Options& options, Console& console) {
  check_output(options);
  Reader reader(options.input, options.raw_input);
  if (options.is_light_only()) return find_light(reader, options, console);
  if (is_picture_kind(options.output_kind)) {
    if (!reader.is_picture()) {
      console.note("the input is a video; its first frame becomes the picture");
    }
    return dehaze_picture(reader, options, console);
  }
  if (reader.is_picture()) {
    throw Error(reader.path() +
                ": a picture cannot become a video; name the output .jpg, .png or .webp");
  }
  return dehaze_video(reader, options, console);
}

}  // namespace

FileResult process_file(const Options& options, Console& console) {
  using Clock = std::chrono::steady_clock;
  const Clock::time_point start = Clock::now();
  FileResult result;
  result.input = options.input;
  result.output = options.output;
  try {
    result.outcome = process(options, console);
    result.status = FileStatus::kDone;
    result.exit_status = kExitDone;
  } catch (const UsageError& error) {
    result.message = error.what();
    result.exit_status = kExitUsage;
  } catch (const std::bad_alloc&) {
    result.message = options.input + ": not enough memory";
  } catch (const std::exception& error) {
    result.message = error.what();
  }
  console.clear_progress();
  result.seconds = std::chrono::duration<double>(Clock::now() - start).count();
  result.notes = console.notes();
  return result;
}

std::string timing_text(const Outcome& outcome) {
  return "time per frame: " + describe(outcome.report.times);
}

}  // namespace dehaze
