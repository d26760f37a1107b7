#include "sources/diagnostics/lte/Reported.h"

#include <algorithm>
#include <memory>

#include "messages/lte_neighbours.h"
#include "messages/runtime/MessageReader.h"
#include "sources/Filling.h"
#include "sources/Metrics.h"

namespace qel::diagnostics {
namespace {

using rrc::lte::GeranResult;
using rrc::lte::MeasurementReport;
using rrc::lte::Target;
using rrc::lte::UtraResult;
using sources::set;

std::optional<double> rsrpDbm(const std::optional<unsigned>& index) {
  return index ? std::optional(static_cast<double>(*index) - 140) : std::nullopt;
}

std::optional<double> rsrqDb(const std::optional<unsigned>& index) {
  return index ? std::optional(static_cast<double>(*index) / 2 - 19.5) : std::nullopt;
}

// The carrier that a report is about, when the phone was seen to be told.
std::optional<std::uint32_t> carrierOf(const MeasurementReport& report, bool lte,
                                       const LteMeasuring& measuring) {
  if (report.id >= LteMeasuring::kIdentities) return std::nullopt;
  const auto id = measuring.objectOf[report.id];
  if (!id || *id >= LteMeasuring::kIdentities) return std::nullopt;
  const auto& object = measuring.objects[*id];
  if (!object || (object->technology == Target::eutra) != lte) return std::nullopt;
  return object->carrier;
}

LteOther otherOf(const UtraResult& result, std::optional<std::uint32_t> carrier) {
  LteOther other;
  other.kind = LteOther::Kind::umts;
  other.channel = carrier;
  other.code = result.cell;
  other.level = result.rscp;
  other.ecn0 = result.ecn0;
  return other;
}

LteOther otherOf(const GeranResult& result) {
  LteOther other;
  other.kind = LteOther::Kind::gsm;
  other.channel = result.arfcn;
  other.code = result.networkColour << 3 | result.stationColour;
  other.level = static_cast<std::int32_t>(result.rssi);
  return other;
}

void note(LteOther other, std::uint64_t timeMs, std::vector<LteOther>& cells) {
  other.timeMs = timeMs;
  std::erase_if(cells, [&](const LteOther& known) {
    return known.kind == other.kind && known.channel == other.channel && known.code == other.code;
  });
  if (cells.size() >= LteOthers::kMost) {
    cells.erase(std::ranges::min_element(cells, {}, &LteOther::timeMs));
  }
  cells.push_back(other);
}

void addUmts(const LteOther& other, KCellularLteNbrInterRatCellMeas& report) {
  auto entry = makeMessage<EgwErrcNbrUtraMeas>();
  set(*entry, &EgwErrcNbrUtraMeas::setUarfcn, other.channel);
  entry->setPsc(other.code);
  set(*entry, &EgwErrcNbrUtraMeas::setRscp, other.level);
  set(*entry, &EgwErrcNbrUtraMeas::setEcno, other.ecn0);
  report.addMeasNbrUtra(entry);
}

void addGsm(const LteOther& other, KCellularLteNbrInterRatCellMeas& report) {
  auto entry = makeMessage<EgwErrcNbrGeranMeas>();
  set(*entry, &EgwErrcNbrGeranMeas::setArfcn, other.channel);
  entry->setBsic(other.code);
  set(*entry, &EgwErrcNbrGeranMeas::setRxlev, other.level);
  report.addMeasNbrGeran(entry);
}

}  // namespace

void takeReported(const MeasurementReport& report, std::uint64_t timeMs, Picture& picture,
                  Told& told) {
  LtePicture& lte = picture.lte;
  const auto earfcn = carrierOf(report, true, lte.connection.measuring);
  for (const auto& cell : report.eutra) {
    lte.noteNeighbour({{earfcn.value_or(kUnknownEarfcn), cell.pci},
                       rsrpDbm(cell.rsrp),
                       rsrqDb(cell.rsrq),
                       timeMs});
  }
  if (!report.eutra.empty()) told.tell(metric::kLteNeighbours);
  const auto uarfcn = carrierOf(report, false, lte.connection.measuring);
  auto& others = lte.connection.others.cells;
  for (const UtraResult& result : report.utra) note(otherOf(result, uarfcn), timeMs, others);
  for (const GeranResult& result : report.geran) note(otherOf(result), timeMs, others);
  if (!report.utra.empty() || !report.geran.empty()) told.tell(metric::kLteInterRat);
}

std::optional<Bytes> lteOthers(const Picture& picture, std::uint64_t timeMs) {
  const auto& cells = picture.lte.connection.others.cells;
  if (cells.empty()) return std::nullopt;
  KCellularLteNbrInterRatCellMeas report;
  report.setTimestamp(timeMs);
  for (const LteOther& other : cells) {
    (other.kind == LteOther::Kind::umts ? addUmts : addGsm)(other, report);
  }
  return report.data();
}

}  // namespace qel::diagnostics
