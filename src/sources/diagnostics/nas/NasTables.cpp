#include "sources/diagnostics/nas/NasTables.h"

#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/EmmLogs.h"
#include "sources/diagnostics/nas/EpsReports.h"
#include "sources/diagnostics/nas/EsmLogs.h"
#include "sources/diagnostics/nas/MobileLogs.h"
#include "sources/diagnostics/nas/MobileReports.h"
#include "sources/diagnostics/packets/Twin.h"

namespace qel::diagnostics {
namespace {

constexpr std::array kLogs = {
    LogRow{0x7130, "2G/3G packet registration", readGmmState, nullptr},
    LogRow{0x7131, "2G/3G registration", readMmState, nullptr},
    LogRow{0x7135, "2G/3G area", readMmArea, nullptr},
    LogRow{0x7138, "2G/3G temporary identity", readDynamicIdentity, nullptr},
    LogRow{0x713A, "2G/3G registration messages", readMobileMessage, nullptr},
    LogRow{0x7150, "equivalent networks", readEquivalentNetworks, nullptr},
    LogRow{0x7B30, "2G/3G packet registration", readTwin<readGmmState>, nullptr},
    LogRow{0x7B31, "2G/3G registration", readTwin<readMmState>, nullptr},
    LogRow{0x7B35, "2G/3G area", readTwin<readMmArea>, nullptr},
    LogRow{0x7B38, "2G/3G temporary identity", readTwin<readDynamicIdentity>, nullptr},
    LogRow{0x7B3A, "2G/3G registration messages", readTwin<readMobileMessage>, nullptr},
    LogRow{0x7B50, "equivalent networks", readTwin<readEquivalentNetworks>, nullptr},
    LogRow{0xB0E2, "LTE session management, in", readEsmMessages, versionInFirstByte},
    LogRow{0xB0E3, "LTE session management, out", readEsmMessages, versionInFirstByte},
    LogRow{0xB0E4, "LTE bearer state", readBearerState, versionInFirstByte},
    LogRow{0xB0E5, "LTE bearer context", readBearerContext, versionInFirstByte},
    LogRow{0xB0EC, "LTE mobility management, in", readEmmFromNetwork, versionInFirstByte},
    LogRow{0xB0ED, "LTE mobility management, out", readEmmFromPhone, versionInFirstByte},
    LogRow{0xB0EE, "LTE mobility state", readEmmState, versionInFirstByte},
};

constexpr std::array kReports = {
    ReportRow{metric::kMmCommonInfo, networksAndAreas}, ReportRow{metric::kMmContext, mmContext},
    ReportRow{metric::kGmmContext, gmmContext},         ReportRow{metric::kEmmContext, emmContext},
    ReportRow{metric::kBearers, packetConnections},
};

}  // namespace

std::span<const LogRow> nasLogs() { return kLogs; }

std::span<const EventRow> nasEvents() { return {}; }

std::span<const ReportRow> nasReports() { return kReports; }

void age(NasPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
