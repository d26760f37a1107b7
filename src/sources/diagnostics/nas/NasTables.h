// Which packets and events tell about NAS, and which metrics come of them.
#pragma once

#include <span>

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

std::span<const LogRow> nasLogs();
std::span<const EventRow> nasEvents();
std::span<const ReportRow> nasReports();

// Forgets what is too old at that time of the modem's.
void age(NasPicture& picture, std::uint64_t nowMs);

}  // namespace qel::diagnostics
