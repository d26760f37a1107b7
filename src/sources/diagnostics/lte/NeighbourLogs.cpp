#include "sources/diagnostics/lte/NeighbourLogs.h"

#include <algorithm>

#include "sources/Metrics.h"
#include "sources/diagnostics/layouts/LteSignalBlocks.h"
#include "sources/diagnostics/lte/Judged.h"
#include "sources/diagnostics/lte/LevelCheck.h"
#include "sources/diagnostics/lte/LteRead.h"
#include "sources/diagnostics/packets/Subpackets.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kIdleResult = 27;
constexpr std::uint8_t kConnectedResult = 31;

LteNeighbour neighbourOf(const LteCellName& name, const Values& values, std::uint64_t timeMs) {
  return {name, values[Field::rsrp], values[Field::rsrq], timeMs};
}

void note(const std::vector<LteNeighbour>& cells, LtePicture& lte, Told& told) {
  for (const LteNeighbour& cell : cells) lte.neighbours.note(cell);
  if (!cells.empty()) told.tell(metric::kLteNeighbours);
}

Outcome readListed(const LogPacket& packet, std::uint8_t part, Picture& picture, Told& told) {
  const JudgedCells judged = readJudged(packet, part, neighbourAgrees);
  std::vector<LteNeighbour> cells;
  for (const JudgedCell& cell : judged.cells) {
    cells.push_back(neighbourOf(cell.name, cell.values, packet.timeMs));
  }
  note(cells, picture.lte, told);
  return judged.outcome;
}

// How well the serving cell is received, for want of a log that says it antenna by antenna.
void noteLevel(const Reading& reading, std::uint64_t timeMs, LtePicture& lte, Told& told) {
  const Values& head = reading.head;
  if (!isLikely(head[Field::rsrp], head[Field::rsrq])) return;
  const bool isFirst = !lte.level;  // then such a log may only be on its way
  lte.level = LteLevel{head[Field::rsrp], head[Field::rsrq], head.find(Field::rssi), timeMs};
  if (!lte.signal && !isFirst) told.tell(metric::kLteServingMeasurement);
}

// Nothing when one of them cannot be a cell: then the packet is something else. A cell that the
// modem knows and has not heard reads as the scale's lowest.
std::optional<std::vector<LteNeighbour>> neighboursOf(const Reading& reading,
                                                      std::uint64_t timeMs) {
  std::vector<LteNeighbour> cells;
  for (const Values& values : reading.records) {
    const LteCellName name{reading.head.number(Field::earfcn), values.number(Field::pci)};
    if (!isCell(name)) return std::nullopt;
    if (values[Field::rsrp] <= kRsrp.addend) continue;
    if (!isLikely(values[Field::rsrp], values[Field::rsrq])) return std::nullopt;
    cells.push_back(neighbourOf(name, values, timeMs));
  }
  return cells;
}

}  // namespace

Outcome readLteIdleNeighbours(const LogPacket& packet, Picture& picture, Told& told) {
  return readListed(packet, kIdleResult, picture, told);
}

Outcome readLteConnectedNeighbours(const LogPacket& packet, Picture& picture, Told& told) {
  return readListed(packet, kConnectedResult, picture, told);
}

std::optional<unsigned> lteIdleNeighboursVersion(ByteView body) {
  return versionOfSubpacket<kIdleResult>(body);
}

std::optional<unsigned> lteConnectedNeighboursVersion(ByteView body) {
  return versionOfSubpacket<kConnectedResult>(body);
}

Outcome readLteConnectedCells(const LogPacket& packet, Picture& picture, Told& told) {
  return readWhole(packet, [&](const Reading& reading) {
    const LteCellName server = nameOf(reading.head);
    const auto cells = neighboursOf(reading, packet.timeMs);
    if (!cells || !isCell(server)) return Outcome::damaged;
    if (reading.head.number(Field::cellIndex) == 0) {
      picture.lte.measureFrom(server);
      noteLevel(reading, packet.timeMs, picture.lte, told);
    }
    note(*cells, picture.lte, told);
    return Outcome::understood;
  });
}

Outcome readLteIdleIntra(const LogPacket& packet, Picture& picture, Told& told) {
  return readWhole(packet, [&](const Reading& reading) {
    const auto cells = neighboursOf(reading, packet.timeMs);
    if (!cells) return Outcome::damaged;
    note(*cells, picture.lte, told);
    return Outcome::understood;
  });
}

Outcome readLteIdleServing(const LogPacket& packet, Picture& picture, Told& told) {
  return readWhole(packet, [&](const Reading& reading) {
    const LteCellName server = nameOf(reading.head);
    if (!isCell(server)) return Outcome::damaged;
    picture.lte.measureFrom(server);
    noteLevel(reading, packet.timeMs, picture.lte, told);
    return Outcome::understood;
  });
}

}  // namespace qel::diagnostics
