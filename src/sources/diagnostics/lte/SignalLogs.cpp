#include "sources/diagnostics/lte/SignalLogs.h"

#include <algorithm>

#include "sources/Metrics.h"
#include "sources/diagnostics/lte/Judged.h"
#include "sources/diagnostics/lte/LevelCheck.h"
#include "sources/diagnostics/lte/LteRead.h"
#include "sources/diagnostics/packets/Subpackets.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kServingCellResult = 25;

// Of the cells on the primary carrier the one that serves; older modems list no other.
const JudgedCell* primaryOf(const std::vector<JudgedCell>& cells) {
  const JudgedCell* first = nullptr;
  for (const JudgedCell& cell : cells) {
    if (cell.values.number(Field::cellIndex) != 0) continue;
    if (cell.values.find(Field::isServing).value_or(0) != 0) return &cell;
    if (!first) first = &cell;
  }
  return first;
}

// Levels go to a carrier that the network is known to have configured, and to no other cell.
bool takeSecondary(const JudgedCell& cell, std::uint64_t timeMs, LtePicture& lte) {
  const std::uint32_t index = cell.values.number(Field::cellIndex);
  const auto carrier =
      std::find_if(lte.carriers.begin(), lte.carriers.end(), [&](const SecondaryCarrier& known) {
        return known.index == index && known.pci.value_or(cell.name.pci) == cell.name.pci;
      });
  if (index == 0 || carrier == lte.carriers.end()) return false;
  carrier->active = true;
  carrier->signal = LteSignal{cell.name, cell.antennas, timeMs};
  return true;
}

}  // namespace

Outcome readLteMeasurement(const LogPacket& packet, Picture& picture, Told& told) {
  const JudgedCells judged = readJudged(packet, kServingCellResult, serverAgrees);
  LtePicture& lte = picture.lte;
  if (judged.outcome != Outcome::understood) return judged.outcome;
  if (const JudgedCell* primary = primaryOf(judged.cells)) {
    // Phones elsewhere measure cells here too.
    if (!picture.technology) changeTo(picture, Technology::lte);
    lte.measureFrom(primary->name);
    lte.signal = LteSignal{primary->name, primary->antennas, packet.timeMs};
    told.tell(metric::kLteServingMeasurement);
    told.tell(metric::kLteRsrpRsrqSinr);
  }
  for (const JudgedCell& cell : judged.cells) {
    if (takeSecondary(cell, packet.timeMs, lte)) told.tell(metric::kLteCarrierAggregation);
  }
  return Outcome::understood;
}

std::optional<unsigned> lteMeasurementVersion(ByteView body) {
  return versionOfSubpacket<kServingCellResult>(body);
}

}  // namespace qel::diagnostics
