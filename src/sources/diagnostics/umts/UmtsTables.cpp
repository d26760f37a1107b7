#include "sources/diagnostics/umts/UmtsTables.h"

#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/picture/Age.h"
#include "sources/diagnostics/umts/UmtsReaders.h"
#include "sources/diagnostics/umts/UmtsReports.h"

namespace qel::diagnostics {
namespace {

constexpr std::array kLogs = {
    LogRow{0x4127, "UMTS serving cell", readUmtsCell, nullptr},
    LogRow{0x4125, "UMTS RRC state", readUmtsState, nullptr},
    LogRow{0x4005, "UMTS reselection ranks", readUmtsRanks, versionOfUmtsRanks},
    LogRow{0x412F, "UMTS RRC message", readUmtsRrcMessage, nullptr},
    LogRow{0x4176, "UMTS gain control", readUmtsGainControl, versionInFirstByte},
};

constexpr std::array kReports = {
    ReportRow{metric::kUmtsRrcState, umtsRrcState},
    ReportRow{metric::kUmtsRrcConfig, umtsRrcConfiguration},
    ReportRow{metric::kUmtsCellInfo, umtsCell},
    ReportRow{metric::kUmtsServingMeasurement, umtsSignal},
    ReportRow{metric::kUmtsTxPower, umtsTransmitPower},
    ReportRow{metric::kUmtsSelRes, umtsReselection},
    ReportRow{metric::kUmtsNeighbours, umtsNeighbours},
};

void age(std::optional<UmtsLevel>& level, std::uint64_t nowMs) {
  if (level && isOld(level->timeMs, nowMs, kSignalMs)) level.reset();
}

}  // namespace

std::span<const LogRow> umtsLogs() { return kLogs; }

// The meaning of its events' values (571, 1496, 1497) is not known.
std::span<const EventRow> umtsEvents() { return {}; }

std::span<const ReportRow> umtsReports() { return kReports; }

void age(UmtsPicture& picture, std::uint64_t nowMs) {
  age(picture.signal.rscpDbm, nowMs);
  age(picture.signal.ecnoDb, nowMs);
  for (auto& rssiDbm : picture.signal.rssiDbm) age(rssiDbm, nowMs);
  age(picture.transmitDbm, nowMs);
  if (picture.neighbours && isOld(picture.neighbours->timeMs, nowMs, kNeighbourMs))
    picture.neighbours.reset();
}

}  // namespace qel::diagnostics
