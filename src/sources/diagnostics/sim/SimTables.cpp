#include "sources/diagnostics/sim/SimTables.h"

namespace qel::diagnostics {

std::span<const LogRow> simLogs() { return {}; }

std::span<const EventRow> simEvents() { return {}; }

std::span<const ReportRow> simReports() { return {}; }

void age(SimPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
