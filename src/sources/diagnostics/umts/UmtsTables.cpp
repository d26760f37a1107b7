#include "sources/diagnostics/umts/UmtsTables.h"

namespace qel::diagnostics {

std::span<const LogRow> umtsLogs() { return {}; }

std::span<const EventRow> umtsEvents() { return {}; }

std::span<const ReportRow> umtsReports() { return {}; }

void age(UmtsPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
