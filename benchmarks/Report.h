// Tables in Markdown of all works: time and allocations for one payload, mix beside mix.
#pragma once

#include <benchmark/benchmark.h>

#include <limits>
#include <string>
#include <vector>

namespace qel::bench {

// Keeps the least time of each work's repetitions; the ratio is to the first of the same work.
// Benchmarks are named "work|who|mix" and count "payloads" (an iteration) and "allocations" (a
// payload).
class Report final : public benchmark::BenchmarkReporter {
 public:
  // The benchmarks in the order in which to report them. Those that did not run are left out.
  explicit Report(const std::vector<std::string>& names);

  bool ReportContext(const Context&) override { return true; }
  void ReportRuns(const std::vector<Run>& runs) override;
  void Finalize() override;

 private:
  struct Cell {
    std::string name;
    std::string work, who, mix;
    double nanoseconds = std::numeric_limits<double>::infinity();
    double allocations = 0;
  };
  using Cells = std::vector<const Cell*>;

  // The work's rows; before them the head of a table when its mixes are others than those above.
  void printWork(const Cells& cells, std::vector<std::string>& columns);

  std::vector<Cell> _cells;
};

}  // namespace qel::bench
