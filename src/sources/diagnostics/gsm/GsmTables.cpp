#include "sources/diagnostics/gsm/GsmTables.h"

namespace qel::diagnostics {

std::span<const LogRow> gsmLogs() { return {}; }

std::span<const EventRow> gsmEvents() { return {}; }

std::span<const ReportRow> gsmReports() { return {}; }

void age(GsmPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
