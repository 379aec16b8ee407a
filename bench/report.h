// Collects the runs of all benchmarks and prints them as one table.
#pragma once

#include <benchmark/benchmark.h>

#include <map>
#include <string>
#include <vector>

#include "bench/case.h"

namespace haze::bench {

struct Times {
  double median = 0;
  double minimum = 0;
};

// Milliseconds of the repetitions of one benchmark, by its name.
class Report : public benchmark::BenchmarkReporter {
 public:
  bool ReportContext(const Context& context) override;
  void ReportRuns(const std::vector<Run>& runs) override;

  // Prints the table of the cases of each frame size, then that of the threaded stages.
  void print_tables(const std::vector<Case>& cases, const std::vector<Size>& frames) const;
  bool write_json(const std::string& path, const std::vector<Case>& cases) const;

 private:
  Times times(const std::string& name) const;
  void print_row(const Case& c, Size frame) const;

  std::map<std::string, std::vector<double>> milliseconds_;
};

// Names of the benchmarks of a case.
std::string size_name(Size size);
std::string benchmark_name(const Case& c, const char* variant);
std::string copy_name(Size frame);

// Machine, compiler, flags, version and commit, one line each.
std::vector<std::string> environment();

}  // namespace haze::bench
