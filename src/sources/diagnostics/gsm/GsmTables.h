// Which packets and events tell about GSM, and which metrics come of them.
#pragma once

#include <span>

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

std::span<const LogRow> gsmLogs();
std::span<const EventRow> gsmEvents();
std::span<const ReportRow> gsmReports();

// Forgets what is too old at that time of the modem's.
void age(GsmPicture& picture, std::uint64_t nowMs);

}  // namespace qel::diagnostics
