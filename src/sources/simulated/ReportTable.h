// Which metrics the simulated modem reports, and how often.
#pragma once

#include <cstdint>
#include <span>

#include "sources/simulated/Reports.h"

namespace qel::sources {

// The drive goes on in steps of that length.
inline constexpr std::uint64_t kStepMs = 200;

struct ReportRow {
  std::uint32_t metric;
  std::uint32_t periodMs;  // a multiple of the step; 0: only when something changes, or on query
  std::uint32_t phaseMs;   // within the step, so that reports do not all come at once
  bool atStart;            // reported in the first step, too
  BuildReport build;
};

// All metrics of the catalogue.
std::span<const ReportRow> reportTable();
const ReportRow* findReport(std::uint32_t metric);

}  // namespace qel::sources
