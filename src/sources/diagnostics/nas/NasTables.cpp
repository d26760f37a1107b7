#include "sources/diagnostics/nas/NasTables.h"

#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/EmmLogs.h"
#include "sources/diagnostics/nas/EpsReports.h"
#include "sources/diagnostics/nas/EsmLogs.h"

namespace qel::diagnostics {
namespace {

constexpr std::array kLogs = {
    LogRow{0xB0E2, "LTE session management, in", readEsmMessages, versionInFirstByte},
    LogRow{0xB0E3, "LTE session management, out", readEsmMessages, versionInFirstByte},
    LogRow{0xB0E4, "LTE bearer state", readBearerState, versionInFirstByte},
    LogRow{0xB0E5, "LTE bearer context", readBearerContext, versionInFirstByte},
    LogRow{0xB0EC, "LTE mobility management, in", readEmmFromNetwork, versionInFirstByte},
    LogRow{0xB0ED, "LTE mobility management, out", readEmmFromPhone, versionInFirstByte},
    LogRow{0xB0EE, "LTE mobility state", readEmmState, versionInFirstByte},
};

constexpr std::array kReports = {
    ReportRow{metric::kMmCommonInfo, networksAndAreas},
    ReportRow{metric::kEmmContext, emmContext},
    ReportRow{metric::kBearers, packetConnections},
};

}  // namespace

std::span<const LogRow> nasLogs() { return kLogs; }

std::span<const EventRow> nasEvents() { return {}; }

std::span<const ReportRow> nasReports() { return kReports; }

void age(NasPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
