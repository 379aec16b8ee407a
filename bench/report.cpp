#include "bench/report.h"

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <thread>

#include "bench/goals.h"
#include "core/cpu_level.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

Times times_of(std::vector<double> runs) {
  if (runs.empty()) return {};
  std::sort(runs.begin(), runs.end());
  return {runs[runs.size() / 2], runs[0]};
}

std::string cpu_model() {
  std::ifstream info("/proc/cpuinfo");
  for (std::string line; std::getline(info, line);)
    if (line.rfind("model name", 0) == 0) return line.substr(line.find(':') + 2);
  return "unknown";
}

bool is_avx512() {
#if HAZE_X86
  return cpu_level() == CpuLevel::kAvx512;
#else
  return false;
#endif
}

const char* level_name() {
#if HAZE_X86
  switch (cpu_level()) {
    case CpuLevel::kAvx512:
      return "AVX-512";
    case CpuLevel::kAvx2:
      return "AVX2";
    case CpuLevel::kPortable:
      break;
  }
#endif
  return "portable";
}

double ratio(const Times& a, const Times& b) { return b.minimum > 0 ? a.minimum / b.minimum : 0; }

}  // namespace

std::string size_name(Size size) {
  return std::to_string(size.width) + "x" + std::to_string(size.height);
}

std::string benchmark_name(const Case& c, const char* variant) {
  return c.operation + "/" + size_name(c.size) + "/" + variant;
}

std::string copy_name(Size frame) { return "memcpy of a frame/" + size_name(frame); }

std::vector<std::string> environment() {
  return {"CPU: " + cpu_model() + ", vector paths: " + level_name() + ", one thread",
          std::string("compiler: ") + __VERSION__ + ", flags:" + HAZE_BENCH_FLAGS,
          std::string("haze_preview ") + HAZE_PREVIEW_VERSION_STRING + ", commit " +
              HAZE_BENCH_COMMIT + "; OpenCV " + HAZE_BENCH_OPENCV};
}

bool Report::ReportContext(const Context&) { return true; }

void Report::ReportRuns(const std::vector<Run>& runs) {
  for (const Run& run : runs) {
    if (run.run_type != Run::RT_Iteration || run.error_occurred) continue;
    milliseconds_[run.run_name.function_name].push_back(run.real_accumulated_time /
                                                        static_cast<double>(run.iterations) * 1000);
  }
  std::fprintf(stderr, ".");
}

Times Report::times(const std::string& name) const {
  const auto found = milliseconds_.find(name);
  return found == milliseconds_.end() ? Times{} : times_of(found->second);
}

void Report::print_row(const Case& c, Size frame) const {
  const Times ours = times(benchmark_name(c, "ours"));
  const double recovery = times("frame recovery, NV21/" + size_name(frame) + "/ours").minimum;
  const Ratios ratios = {ratio(ours, times(copy_name(frame))),
                         recovery > 0 ? ours.minimum / recovery : 0,
                         ratio(times(benchmark_name(c, "peer")), ours),
                         ratio(times(benchmark_name(c, "portable")), ours)};
  std::printf("| %s | %s | %.4f | %.4f | %.2f | %.1f x | %s | ", c.operation.c_str(),
              size_name(c.size).c_str(), ours.minimum, ours.median, ratios.copies, ratios.portable,
              c.peer_name.c_str());
  if (c.peer) std::printf("%.1f x ", ratios.peer);
  // Goals are stated for the largest frame.
  const Bounds bounds = frame.width == 1280 ? bounds_of(c.operation, is_avx512()) : Bounds{};
  const std::string goal = describe(bounds);
  std::printf("| %s | %s |\n", goal.c_str(),
              goal == "-"               ? "-"
              : reached(bounds, ratios) ? "yes"
                                        : "no");
}

void Report::print_tables(const std::vector<Case>& cases, const std::vector<Size>& frames) const {
  std::printf("\n");
  for (const std::string& line : environment()) std::printf("%s\n", line.c_str());
  std::printf(
      "\nMinimum and median of interleaved runs in ms; ratios of minima from this run alone.\n\n"
      "| operation | size | min | median | x memcpy of the frame | faster than portable | peer | "
      "faster than peer | goal | reached |\n|---|---|---|---|---|---|---|---|---|---|\n");
  for (const Size frame : frames)
    for (const Case& c : cases)
      if (c.frame.width == frame.width && c.frame.height == frame.height) print_row(c, frame);
  std::printf(
      "\nThreads on %u cores: the same work, threaded and not.\n\n"
      "| operation | size | min | median | faster than one thread |\n|---|---|---|---|---|\n",
      std::thread::hardware_concurrency());
  for (const Case& c : cases) {
    if (c.frame.width != 0) continue;
    const Times ours = times(benchmark_name(c, "ours"));
    std::printf("| %s | %s | %.4f | %.4f | ", c.operation.c_str(),
                c.peer ? size_name(c.size).c_str() : "", ours.minimum, ours.median);
    if (c.peer) std::printf("%.2f x ", ratio(times(benchmark_name(c, "peer")), ours));
    std::printf("|\n");
  }
}

bool Report::write_json(const std::string& path, const std::vector<Case>& cases) const {
  std::ofstream json(path);
  json << "{\n  \"environment\": [";
  const char* separator = "\n";
  for (const std::string& line : environment()) {
    json << separator << "    \"" << line << '"';
    separator = ",\n";
  }
  json << "\n  ],\n  \"peers\": {";
  separator = "\n";
  for (const Case& c : cases) {
    json << separator << "    \"" << c.operation << '/' << size_name(c.size) << "\": \""
         << c.peer_name << '"';
    separator = ",\n";
  }
  json << "\n  },\n  \"milliseconds\": {";
  separator = "\n";
  for (const auto& [name, runs] : milliseconds_) {
    json << separator << "    \"" << name << "\": [";
    for (size_t i = 0; i < runs.size(); ++i) json << (i == 0 ? "" : ", ") << runs[i];
    json << ']';
    separator = ",\n";
  }
  json << "\n  }\n}\n";
  return static_cast<bool>(json);
}

}  // namespace haze::bench
