// Which packets and events tell about UMTS, and which metrics come of them.
#pragma once

#include <span>

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

std::span<const LogRow> umtsLogs();
std::span<const EventRow> umtsEvents();
std::span<const ReportRow> umtsReports();

// Forgets what is too old at that time of the modem's.
void age(UmtsPicture& picture, std::uint64_t nowMs);

}  // namespace qel::diagnostics
