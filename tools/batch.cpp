#include "batch.h"

#include <poll.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <list>
#include <system_error>

#include "batch_plan.h"
#include "console.h"
#include "interrupt.h"
#include "json.h"
#include "outcome.h"
#include "output_kind.h"
#include "print_line.h"
#include "progress.h"
#include "worker.h"

namespace dehaze {
namespace {

namespace fs = std::filesystem;

constexpr std::chrono::milliseconds kRefreshInterval(200);

class Batch {
 public:
  explicit Batch(const Options& options)
      : options_(options), plan_(plan_batch(options)), console_(options.quiet) {}

  ExitStatus run() {
    if (plan_.files.empty()) throw Error("no pictures or videos in " + options_.sources.front());
    while (next_ < plan_.files.size() || !workers_.empty()) {
      try {
        throw_if_interrupted();
      } catch (const Interrupted&) {
        stop();
        throw;
      }
      while (next_ < plan_.files.size() && workers_.size() < static_cast<size_t>(options_.jobs)) {
        start(plan_.files[next_++]);
      }
      wait_for_workers();
      show_progress();
    }
    console_.clear_progress();
    print_summary();
    return failed_ > 0 ? kExitFailed : kExitDone;
  }

 private:
  void start(const PlannedFile& file) {
    if (!file.failure.empty()) return fail(file.input, file.output, file.failure);
    if (file.is_done_already) return skip(file);
    std::error_code failure;
    const fs::path folder = fs::path(file.output).parent_path();
    if (!folder.empty()) fs::create_directories(folder, failure);
    if (failure) {
      return fail(file.input, file.output,
                  folder.string() + ": cannot make this folder: " + failure.message());
    }
    Options one = options_;
    one.input = file.input;
    one.output = file.output;
    one.output_kind = output_kind_of(file.output);
    workers_.emplace_back(one);
  }

  // Until one of them has something to tell, or the time for the next look at the clock.
  void wait_for_workers() {
    std::vector<struct pollfd> waits;
    for (const Worker& worker : workers_) waits.push_back({worker.descriptor(), POLLIN, 0});
    // Interrupted by signals, which the caller looks at.
    if (waits.empty() ||
        poll(waits.data(), waits.size(), static_cast<int>(kRefreshInterval.count())) <= 0)
      return;
    auto worker = workers_.begin();
    for (const struct pollfd& wait : waits) {
      const bool goes_on = wait.revents == 0 || worker->receive();
      if (wait.revents != 0) print_messages(*worker);
      if (!goes_on) finish(*worker);
      worker = goes_on ? std::next(worker) : workers_.erase(worker);
    }
  }

  void print_messages(Worker& worker) {
    for (const std::string& note : worker.take_notes()) console_.note(worker.input() + ": " + note);
    for (const std::string& line : worker.take_infos()) {
      console_.clear_progress();
      print_info(worker.input() + ": " + line);
    }
    for (const std::string& line : worker.take_output()) {
      console_.clear_progress();
      print_line(stdout, worker.input() + ": " + line);
    }
  }

  void finish(const Worker& worker) {
    if (!worker.is_done()) {
      // A signal from the terminal reaches the children as well.
      if (pending_signal() != 0) return;
      if (worker.json().empty()) return fail(worker.input(), "", worker.failure());
      ++failed_;
      console_.clear_progress();
      print_error(worker.failure());
    } else {
      ++done_;
    }
    if (options_.json) print_line(stdout, worker.json());
  }

  void fail(const std::string& input, const std::string& output, const std::string& message) {
    ++failed_;
    console_.clear_progress();
    print_error(message);
    print_json(input, output, FileStatus::kFailed, message);
  }

  void skip(const PlannedFile& file) {
    ++skipped_;
    print_json(file.input, file.output, FileStatus::kSkipped, "the output exists already");
  }

  void print_json(const std::string& input, const std::string& output, FileStatus status,
                  const std::string& message) {
    if (!options_.json) return;
    FileResult result;
    result.input = input;
    result.output = output;
    result.status = status;
    result.message = message;
    print_line(stdout, to_json(result));
  }

  // "3/12 files, 27 %, 0:40 left; drive.mp4 31 %, dusk.jpg"
  void show_progress() {
    const Clock::time_point now = Clock::now();
    if (!console_.shows_progress() || now - shown_ < kRefreshInterval) return;
    shown_ = now;
    const double finished = done_ + failed_;
    double running = 0;
    for (const Worker& worker : workers_) running += worker.share();
    // Skipped files take no time and tell nothing about the others.
    const double total = static_cast<double>(plan_.files.size()) - skipped_;
    const double share = total > 0 ? (finished + running) / total : 0;
    const double seconds = std::chrono::duration<double>(now - start_).count();
    char text[160];
    std::snprintf(text, sizeof(text), "%d/%zu files, %d %%", done_ + failed_ + skipped_,
                  plan_.files.size(), static_cast<int>(share * 100));
    std::string line = text;
    if (share > 0) {
      const int64_t left = std::llround(seconds * (1 - share) / share);
      std::snprintf(text, sizeof(text), ", %.1f files/min, %s left", share * total * 60 / seconds,
                    duration_text(left).c_str());
      line += text;
    }
    const char* separator = "; ";
    for (const Worker& worker : workers_) {
      line += separator + fs::path(worker.input()).filename().string();
      if (worker.share() > 0) {
        line += " " + std::to_string(static_cast<int>(worker.share() * 100)) + " %";
      }
      separator = ", ";
    }
    console_.show_progress({share, line});
  }

  // The children remove their unfinished files.
  void stop() {
    console_.clear_progress();
    for (Worker& worker : workers_) worker.terminate();
    for (Worker& worker : workers_) {
      while (worker.receive()) {
      }
    }
    workers_.clear();
    print_summary();
  }

  void print_summary() {
    std::string text = std::to_string(done_) + " done, " + std::to_string(skipped_) +
                       " skipped because the output exists, " + std::to_string(failed_) + " failed";
    const size_t left = plan_.files.size() - static_cast<size_t>(done_ + skipped_ + failed_);
    if (left > 0) text += ", " + std::to_string(left) + " not finished";
    if (plan_.others > 0) {
      text += "; " + std::to_string(plan_.others) + " other files left alone";
    }
    if (!options_.quiet) print_info(text);
    if (!options_.json) return;
    JsonObject counts;
    counts.add("done", int64_t{done_})
        .add("skipped", int64_t{skipped_})
        .add("failed", int64_t{failed_})
        .add("unfinished", static_cast<int64_t>(left));
    print_line(stdout, JsonObject().add("summary", counts).text());
  }

  using Clock = std::chrono::steady_clock;

  const Options& options_;
  BatchPlan plan_;
  TerminalConsole console_;
  Clock::time_point start_ = Clock::now();
  Clock::time_point shown_ = start_;
  size_t next_ = 0;
  std::list<Worker> workers_;
  int done_ = 0;
  int skipped_ = 0;
  int failed_ = 0;
};

}  // namespace

ExitStatus run_batch(const Options& options) { return Batch(options).run(); }

}  // namespace dehaze
