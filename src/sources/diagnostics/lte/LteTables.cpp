#include "sources/diagnostics/lte/LteTables.h"

namespace qel::diagnostics {

std::span<const LogRow> lteLogs() { return {}; }

std::span<const EventRow> lteEvents() { return {}; }

std::span<const ReportRow> lteReports() { return {}; }

void age(LtePicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
