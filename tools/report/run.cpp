#include "report/run.h"

#include <cerrno>
#include <cstring>
#include <filesystem>

#include "console.h"
#include "interrupt.h"
#include "output_file.h"
#include "report/collect.h"
#include "report/options.h"
#include "report/page.h"
#include "write_file.h"

namespace dehaze {
namespace {

void write_page(const std::string& text, const ReportOptions& options) {
  throw_if_interrupted();
  OutputFile file(options.output, options.force);
  if (!write_file(file.temporary_path(), text.data(), text.size())) {
    throw Error(options.output + ": cannot write the page: " + std::strerror(errno));
  }
  throw_if_interrupted();
  file.commit();
}

void check_is_file(const std::string& path) {
  std::error_code ignored;
  if (!std::filesystem::is_directory(path, ignored)) return;
  throw Error(path + ": is a folder; a report is about one picture or video");
}

}  // namespace

ExitStatus run_report(int argc, char** argv) {
  const std::optional<ReportOptions> options = parse_report_options(argc, argv);
  if (!options) return kExitDone;
  check_is_file(options->input);
  if (!options->reference.empty()) check_is_file(options->reference);
  check_output_path(options->input, options->output, options->force);
  TerminalConsole console(options->quiet);
  const ReportData data = collect_report(*options, console);
  write_page(report_page(data), *options);
  return kExitDone;
}

}  // namespace dehaze
