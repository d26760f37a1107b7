#include "sources/diagnostics/gsm/GsmTables.h"

#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/gsm/GsmLogs.h"
#include "sources/diagnostics/gsm/GsmReports.h"
#include "sources/diagnostics/packets/Twin.h"
#include "sources/diagnostics/picture/Age.h"

namespace qel::diagnostics {
namespace {

std::optional<unsigned> versionBehindSubscription(ByteView body) {
  return body.empty() ? std::nullopt : versionInFirstByte(body.subspan(1));
}

constexpr std::array kLogs = {
    LogRow{0x506A, "GSM bursts", readGsmVersionedBursts, versionInFirstByte},
    LogRow{0x506C, "GSM bursts", readGsmBursts, nullptr},
    LogRow{0x5071, "GSM monitored cells", readGsmMonitoredCells, nullptr},
    LogRow{0x507A, "GSM serving cell's level", readGsmServingLevel, nullptr},
    LogRow{0x507B, "GSM neighbours' levels", readGsmNeighbourLevels, nullptr},
    LogRow{0x512F, "GSM radio messages", readGsmRadioMessage, nullptr},
    LogRow{0x5130, "GSM reselection parameters", readGsmReselectionParameters, nullptr},
    LogRow{0x5134, "GSM cell", readGsmCell, nullptr},
    LogRow{0x51FC, "GSM reselection levels", readGsmReselectionLevels, nullptr},
    LogRow{0x5A6A, "GSM bursts", readTwin<readGsmVersionedBursts>, versionBehindSubscription},
    LogRow{0x5A6C, "GSM bursts", readTwin<readGsmBursts>, nullptr},
    LogRow{0x5A71, "GSM monitored cells", readTwin<readGsmMonitoredCells>, nullptr},
    LogRow{0x5A7A, "GSM serving cell's level", readTwin<readGsmServingLevel>, nullptr},
    LogRow{0x5A7B, "GSM neighbours' levels", readTwin<readGsmNeighbourLevels>, nullptr},
    LogRow{0x5B2F, "GSM radio messages", readTwin<readGsmRadioMessage>, nullptr},
    LogRow{0x5B30, "GSM reselection parameters", readTwin<readGsmReselectionParameters>, nullptr},
    LogRow{0x5B34, "GSM cell", readTwin<readGsmCell>, nullptr},
    LogRow{0x5BFC, "GSM reselection levels", readTwin<readGsmReselectionLevels>, nullptr},
};

constexpr std::array kReports = {
    ReportRow{metric::kGsmScellInfo, gsmCellReport},
    ReportRow{metric::kGsmIdleConfig, gsmIdleConfigReport},
    ReportRow{metric::kGsmIdleMeasurement, gsmIdleLevelReport},
    ReportRow{metric::kGsmCallMeasurement, gsmCallReport},
    ReportRow{metric::kGsmNeighbours, gsmNeighboursReport},
    ReportRow{metric::kGsmGprsConfig, gsmPacketConfigReport},
};

}  // namespace

std::span<const LogRow> gsmLogs() { return kLogs; }

std::span<const EventRow> gsmEvents() { return {}; }

std::span<const ReportRow> gsmReports() { return kReports; }

void age(GsmPicture& picture, std::uint64_t nowMs) {
  if (picture.idleLevel && isOld(picture.idleLevel->timeMs, nowMs, kSignalMs)) {
    picture.idleLevel.reset();
  }
  if (picture.callLevel && isOld(picture.callLevel->timeMs, nowMs, kSignalMs)) {
    picture.callLevel.reset();
  }
  if (!picture.neighbours) return;
  std::erase_if(*picture.neighbours,
                [&](const GsmNeighbour& cell) { return isOld(cell.timeMs, nowMs, kNeighbourMs); });
}

}  // namespace qel::diagnostics
