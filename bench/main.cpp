// Times every operation beside its yardsticks:
//   haze_preview_bench [JSON-FILE] [--level=avx2|portable] [--benchmark_...]
#include <benchmark/benchmark.h>

#include <cstdio>
#include <cstring>
#include <iterator>
#include <opencv2/core.hpp>

#include "bench/images.h"
#include "bench/report.h"
#include "core/cpu_level.h"

namespace {

using haze::bench::Bytes;
using haze::bench::Case;
using haze::bench::Size;

constexpr Size kFrames[] = {{1280, 720}, {640, 480}};

// Runs `body` with vector paths switched off.
template <typename Body>
auto at_portable_level(Body body) {
#if HAZE_X86
  const haze::CpuLevel level = haze::cpu_level();
  haze::limit_cpu_level(haze::CpuLevel::kPortable);
  auto result = body();
  haze::limit_cpu_level(level);
  return result;
#else
  return body();
#endif
}

void time_it(benchmark::State& state, const std::function<void()>& run) {
  run();
  for (auto _ : state) run();
}

void add_benchmark(const std::string& name, std::function<void(benchmark::State&)> body) {
  benchmark::RegisterBenchmark(name.c_str(), std::move(body))
      ->Unit(benchmark::kMillisecond)
      ->UseRealTime();
}

void add_benchmarks(const std::vector<Case>& cases) {
  for (const Size frame : kFrames) {
    const auto source = haze::bench::shared(haze::bench::hazy_frame(frame));
    const auto target = haze::bench::shared(*source);
    add_benchmark(haze::bench::copy_name(frame), [=](benchmark::State& state) {
      time_it(state, [=] {
        std::memcpy(target->data(), source->data(), source->size());
        benchmark::ClobberMemory();
      });
    });
  }
  for (const Case& c : cases) {
    add_benchmark(haze::bench::benchmark_name(c, "ours"),
                  [&c](benchmark::State& state) { time_it(state, c.run); });
    add_benchmark(haze::bench::benchmark_name(c, "portable"), [&c](benchmark::State& state) {
      at_portable_level([&] {
        time_it(state, c.run);
        return 0;
      });
    });
    if (c.peer) {
      add_benchmark(haze::bench::benchmark_name(c, "peer"),
                    [&c](benchmark::State& state) { time_it(state, c.peer); });
    }
  }
}

// Every level must leave the same bytes.
bool verify(const std::vector<Case>& cases) {
  bool equal = true;
  for (const Case& c : cases) {
    const Bytes portable = at_portable_level(c.output);
    if (c.output() == portable) continue;
    std::fprintf(stderr, "%s: the vector path gives other bytes than the portable one\n",
                 haze::bench::benchmark_name(c, "ours").c_str());
    equal = false;
  }
  return equal;
}

// Takes the option out of the arguments; false if its value is unknown.
bool limit_level(int& argc, char** argv) {
  constexpr char kOption[] = "--level=";
  constexpr size_t kLength = sizeof kOption - 1;
  int kept = 0;
  bool known = true;
  for (int i = 0; i < argc; ++i) {
    if (std::strncmp(argv[i], kOption, kLength) != 0) {
      argv[kept++] = argv[i];
      continue;
    }
#if HAZE_X86
    if (std::strcmp(argv[i] + kLength, "avx2") == 0)
      haze::limit_cpu_level(haze::CpuLevel::kAvx2);
    else if (std::strcmp(argv[i] + kLength, "portable") == 0)
      haze::limit_cpu_level(haze::CpuLevel::kPortable);
    else
      known = false;
#endif
  }
  argc = kept;
  return known;
}

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (!limit_level(argc, argv)) {
    std::fprintf(stderr, "--level: avx2 or portable\n");
    return 2;
  }
  cv::setNumThreads(1);
  std::vector<Case> cases;
  for (const Size frame : kFrames) {
    const size_t first = cases.size();
    haze::bench::add_frame_cases(frame, cases);
    haze::bench::add_color_cases(frame, cases);
    haze::bench::add_filter_cases(frame, cases);
    haze::bench::add_estimate_cases(frame, cases);
    haze::bench::add_recover_cases(frame, cases);
    for (size_t i = first; i < cases.size(); ++i) cases[i].frame = frame;
  }
  haze::bench::add_thread_cases(cases);
  add_benchmarks(cases);
  haze::bench::Report report;
  benchmark::RunSpecifiedBenchmarks(&report);
  report.print_tables(cases, {std::begin(kFrames), std::end(kFrames)});
  if (argc > 1 && !report.write_json(argv[1], cases)) {
    std::fprintf(stderr, "cannot write %s\n", argv[1]);
    return 1;
  }
  if (!verify(cases)) return 1;
  std::printf("\nAll results verified: every CPU level leaves the same bytes.\n");
  return 0;
}
