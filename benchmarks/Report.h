// One table in Markdown of all works: time and allocations for one payload.
#pragma once

#include <benchmark/benchmark.h>

#include <limits>
#include <string>
#include <vector>

namespace qel::bench {

// Keeps the least time of each work's repetitions; the ratio is to the first of the same work.
// Benchmarks are named "work|who" and count "payloads" (an iteration) and "allocations" (a
// payload).
class Report final : public benchmark::BenchmarkReporter {
 public:
  // The benchmarks in the order in which to report them. Those that did not run are left out.
  explicit Report(const std::vector<std::string>& names);

  bool ReportContext(const Context&) override { return true; }
  void ReportRuns(const std::vector<Run>& runs) override;
  void Finalize() override;

 private:
  struct Row {
    std::string name;
    double nanoseconds = std::numeric_limits<double>::infinity();
    double allocations = 0;
  };

  std::vector<Row> _rows;
};

}  // namespace qel::bench
