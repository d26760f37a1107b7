#include "sources/diagnostics/nas/NasTables.h"

namespace qel::diagnostics {

std::span<const LogRow> nasLogs() { return {}; }

std::span<const EventRow> nasEvents() { return {}; }

std::span<const ReportRow> nasReports() { return {}; }

void age(NasPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
