#include "Report.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <ostream>

namespace qel::bench {

Report::Report(const std::vector<std::string>& names) {
  for (const std::string& name : names) _rows.push_back({.name = name});
}

void Report::ReportRuns(const std::vector<Run>& runs) {
  for (const Run& run : runs) {
    if (run.run_type != Run::RT_Iteration || run.error_occurred) continue;
    const double payloads = run.counters.at("payloads") * static_cast<double>(run.iterations);
    const double nanoseconds = run.cpu_accumulated_time * 1e9 / payloads;
    const std::string& name = run.run_name.function_name;
    const auto row =
        std::ranges::find_if(_rows, [&](const Row& known) { return known.name == name; });
    if (row == _rows.end()) continue;
    row->nanoseconds = std::min(row->nanoseconds, nanoseconds);
    row->allocations = run.counters.at("allocations");
  }
}

void Report::Finalize() {
  std::ostream& out = GetOutputStream();
  out << "| work | who | ns | ratio | allocations |\n|---|---|--:|--:|--:|\n";
  std::string work;
  double first = 0;  // of the work
  for (const Row& row : _rows) {
    if (!std::isfinite(row.nanoseconds)) continue;
    const auto bar = row.name.find('|');
    if (row.name.substr(0, bar) != work) {
      work = row.name.substr(0, bar);
      first = row.nanoseconds;
    }
    std::array<char, 64> numbers;
    std::snprintf(numbers.data(), numbers.size(), "%.0f | %.2f | %.2f", row.nanoseconds,
                  row.nanoseconds / first, row.allocations);
    out << "| " << work << " | " << row.name.substr(bar + 1) << " | " << numbers.data() << " |\n";
  }
}

}  // namespace qel::bench
