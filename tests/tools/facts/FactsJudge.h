// Compares a recording that was made of a raw log with what an independent reader found in it.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

namespace qel::testing {

struct MetricVerdict {
  std::uint64_t expected = 0;
  std::uint64_t found = 0;
  std::uint64_t missing = 0;
  std::uint64_t softMissing = 0;  // of facts that need not be told
  std::uint64_t extra = 0;        // values that no fact has
};

struct Verdict {
  std::map<std::string, MetricVerdict> metrics;  // "METRIC" or "METRIC GROUP"
  std::vector<std::string> complaints;           // the first of each metric

  // A line a metric.
  std::string table() const;
};

// What a file of facts looks like is said in tests/data/diag/README.md. `log` is the raw log that
// the facts and the recording are of.
Verdict judge(const std::string& facts, const std::string& log, const std::string& recording);

}  // namespace qel::testing
