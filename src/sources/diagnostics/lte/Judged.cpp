#include "sources/diagnostics/lte/Judged.h"

#include <algorithm>
#include <cstdlib>
#include <optional>
#include <span>

#include "sources/diagnostics/lte/LevelCheck.h"
#include "sources/diagnostics/packets/Subpackets.h"

namespace qel::diagnostics {
namespace {

std::vector<JudgedCell> cellsOf(const Reading& reading) {
  std::vector<JudgedCell> cells;
  for (const Values& values : reading.records) {
    const LteCellName name{reading.head.number(Field::earfcn), values.number(Field::pci)};
    cells.push_back({name, antennasOf(values), values});
  }
  return cells;
}

JudgedCells readKnown(const Layout& layout, ByteView data, bool (*agrees)(const LteAntennas&)) {
  const auto reading = read(layout, data);
  if (!reading) return {};
  JudgedCells judged{Outcome::understood, cellsOf(*reading)};
  std::erase_if(judged.cells, [&](const JudgedCell& cell) {
    return !isCell(cell.name) || !agrees(cell.antennas);
  });
  if (judged.cells.empty() && !reading->records.empty()) return {};
  return judged;
}

JudgedCells readUnknown(std::span<const Layout> layouts, unsigned version, ByteView data,
                        bool (*agrees)(const LteAntennas&)) {
  std::vector<const Layout*> nearest;
  for (const Layout& layout : layouts) nearest.push_back(&layout);
  const auto distance = [&](const Layout* layout) {
    return std::abs(static_cast<int>(layout->version) - static_cast<int>(version));
  };
  std::stable_sort(nearest.begin(), nearest.end(),
                   [&](const Layout* a, const Layout* b) { return distance(a) < distance(b); });
  for (const Layout* layout : nearest) {
    const auto reading = read(*layout, data);
    if (!reading || reading->records.empty()) continue;
    std::vector<JudgedCell> cells = cellsOf(*reading);
    const bool fits = std::all_of(cells.begin(), cells.end(), [&](const JudgedCell& cell) {
      return isCell(cell.name) && agrees(cell.antennas) && standsOut(cell.values, cell.antennas);
    });
    if (fits) return {Outcome::understood, std::move(cells)};
  }
  return {Outcome::unknownVersion, {}};
}

}  // namespace

JudgedCells readJudged(const LogPacket& packet, std::uint8_t id,
                       bool (*agrees)(const LteAntennas& antennas)) {
  const Subpacket part = findSubpacket(packet.body, id);
  if (part.outcome != Outcome::understood) return {part.outcome, {}};
  const Layout* layout = findLayout(packet.code, id, part.version);
  const JudgedCells known =
      layout ? readKnown(*layout, part.data, agrees) : JudgedCells{Outcome::unknownVersion, {}};
  if (known.outcome == Outcome::understood) return known;
  // Some modems write another layout under the number of one that is known.
  JudgedCells tried = readUnknown(layoutsOf(packet.code, id), part.version, part.data, agrees);
  return tried.outcome == Outcome::understood ? tried : known;
}

}  // namespace qel::diagnostics
