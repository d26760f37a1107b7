// Which packets and events tell about SIM, and which metrics come of them.
#pragma once

#include <span>

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

std::span<const LogRow> simLogs();
std::span<const EventRow> simEvents();
std::span<const ReportRow> simReports();

// Forgets what is too old at that time of the modem's.
void age(SimPicture& picture, std::uint64_t nowMs);

}  // namespace qel::diagnostics
