// dehaze: takes haze, fog and smog out of pictures and videos.
#include <csignal>
#include <cstdio>
#include <exception>
#include <new>
#include <optional>

#include "batch.h"
#include "console.h"
#include "errors.h"
#include "interrupt.h"
#include "media/av_error.h"
#include "one_file.h"
#include "options.h"
#include "outcome.h"
#include "print_line.h"
#include "report/options.h"
#include "report/run.h"
#include "show.h"

namespace dehaze {
namespace {

ExitStatus run_single(const Options& options) {
  // Where the frames go to standard output, the results take the place of the notes.
  const bool frames_on_stdout = options.output == "-";
  TerminalConsole console(options.quiet || (options.json && frames_on_stdout));
  const FileResult result = process_file(options, console);
  if (options.json) {
    print_line(frames_on_stdout ? stderr : stdout, to_json(result));
    if (frames_on_stdout) return result.exit_status;
  }
  if (!result.outcome) {
    print_error(result.message);
    return result.exit_status;
  }
  if (options.engine.show == Show::kLight && !options.json) {
    print_line(stdout, describe(result.outcome->report.findings));
  }
  // Asked for by name, so not subject to --quiet.
  if (options.timing) print_info(timing_text(*result.outcome));
  return kExitDone;
}

int guarded_main(int argc, char** argv) {
  try {
    watch_signals();
    capture_av_log();
    if (asks_for_report(argc, argv)) return run_report(argc - 1, argv + 1);
    const std::optional<Options> options = parse_options(argc, argv);
    if (!options) return kExitDone;
    return options->is_batch() ? run_batch(*options) : run_single(*options);
  } catch (const Interrupted& interrupted) {
    const int number = interrupted.signal_number();
    if (number != SIGPIPE) print_error("interrupted; no unfinished file was left behind");
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
