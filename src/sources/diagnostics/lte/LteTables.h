// Which packets and events tell about LTE, and which metrics come of them.
#pragma once

#include <span>

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

std::span<const LogRow> lteLogs();
std::span<const EventRow> lteEvents();
std::span<const ReportRow> lteReports();

// Forgets what is too old at that time of the modem's.
void age(LtePicture& picture, std::uint64_t nowMs);

}  // namespace qel::diagnostics
