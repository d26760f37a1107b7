#include "sources/diagnostics/lte/LteTables.h"

#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/layouts/LteLayouts.h"
#include "sources/diagnostics/lte/CellLogs.h"
#include "sources/diagnostics/lte/CellReports.h"
#include "sources/diagnostics/lte/NeighbourLogs.h"
#include "sources/diagnostics/lte/OverTheAirLog.h"
#include "sources/diagnostics/lte/PowerLogs.h"
#include "sources/diagnostics/lte/Reported.h"
#include "sources/diagnostics/lte/RrcReports.h"
#include "sources/diagnostics/lte/RrcStates.h"
#include "sources/diagnostics/lte/SignalLogs.h"
#include "sources/diagnostics/lte/SignalReports.h"
#include "sources/diagnostics/lte/SystemInformation.h"
#include "sources/diagnostics/picture/Age.h"

namespace qel::diagnostics {
namespace {

// By code.
constexpr std::array kLogs = {
    LogRow{0xB0C0, "LTE RRC over the air", readLteOverTheAir, versionInFirstByte},
    LogRow{kLteBroadcastLog, "LTE MIB", readLteBroadcast, versionInFirstByte},
    LogRow{kLteServingCellLog, "LTE serving cell", readLteServingCell, versionInFirstByte},
    LogRow{kLtePuschLog, "LTE PUSCH power", readLtePusch, versionInFirstByte},
    LogRow{kLtePucchLog, "LTE PUCCH power", readLtePucch, versionInFirstByte},
    LogRow{kLteConnectedCellsLog, "LTE connected cells", readLteConnectedCells, versionInFirstByte},
    LogRow{kLteIdleServingLog, "LTE idle serving cell", readLteIdleServing, versionInFirstByte},
    LogRow{kLteIdleIntraLog, "LTE idle neighbours", readLteIdleIntra, versionInFirstByte},
    LogRow{kLteIdleNeighboursLog, "LTE idle measurement", readLteIdleNeighbours,
           lteIdleNeighboursVersion},
    LogRow{kLteMeasurementLog, "LTE serving cell measurement", readLteMeasurement,
           lteMeasurementVersion},
    LogRow{kLteConnectedNeighboursLog, "LTE connected measurement", readLteConnectedNeighbours,
           lteConnectedNeighboursVersion},
    LogRow{kLteFoundCellLog, "LTE found cell", readLteBroadcast, versionInFirstByte},
};

// By identifier.
constexpr std::array kEvents = {
    EventRow{1606, "LTE RRC state", readRrcState},
    EventRow{1607, "LTE out of service", readOutOfService},
    EventRow{1608, "LTE radio link failure", readRadioLinkFailure},
    EventRow{1611, "LTE new cell", readLteNewCell},
};

constexpr std::array kReports = {
    ReportRow{metric::kLteScellInfo, lteCell},
    ReportRow{metric::kLteRrcState, lteRrcState},
    ReportRow{metric::kLteCdrxConfig, lteReception},
    ReportRow{metric::kLteRadioLinkFailure, lteRadioLinkFailure},
    ReportRow{metric::kLteRsrpRsrqSinr, lteQuality},
    ReportRow{metric::kLteServingMeasurement, lteMeasurement},
    ReportRow{metric::kLteTxPower, lteTxPower},
    ReportRow{metric::kLteComponentCarriers, lteComponents},
    ReportRow{metric::kLteSelRes, lteRules},
    ReportRow{metric::kLteNeighbours, lteNeighbours},
    ReportRow{metric::kLteInterRat, lteOthers},
    ReportRow{metric::kLteCarrierAggregation, lteCarriers},
};

constexpr std::uint64_t kFailureMs = 30'000;  // so long a loss of the connection is news

void ageSignals(LtePicture& picture, std::uint64_t nowMs) {
  const auto isOldSignal = [&](const std::optional<LteSignal>& signal) {
    return signal && isOld(signal->timeMs, nowMs, kSignalMs);
  };
  if (isOldSignal(picture.signal)) picture.signal.reset();
  if (picture.level && isOld(picture.level->timeMs, nowMs, kSignalMs)) picture.level.reset();
  for (SecondaryCarrier& carrier : picture.carriers) {
    if (!isOldSignal(carrier.signal)) continue;
    carrier.signal.reset();
    carrier.active.reset();
  }
  for (LteTransmissions* sent : {&picture.pusch, &picture.pucch}) {
    if (isOld(sent->timeMs, nowMs, kSignalMs)) *sent = {};
  }
}

}  // namespace

std::span<const LogRow> lteLogs() { return kLogs; }

std::span<const EventRow> lteEvents() { return kEvents; }

std::span<const ReportRow> lteReports() { return kReports; }

void age(LtePicture& picture, std::uint64_t nowMs) {
  ageSignals(picture, nowMs);
  picture.neighbours.forget(
      [&](std::uint64_t timeMs) { return isOld(timeMs, nowMs, kNeighbourMs); });
  std::erase_if(picture.connection.others.cells,
                [&](const LteOther& cell) { return isOld(cell.timeMs, nowMs, kNeighbourMs); });
  auto& failure = picture.connection.failure;
  if (failure && isOld(failure->timeMs, nowMs, kFailureMs)) failure.reset();
}

}  // namespace qel::diagnostics
