// The ranking of cells by which an idle phone selects the next one: 0x4005.
#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/packets/Bits.h"
#include "sources/diagnostics/umts/UmtsReaders.h"

namespace qel::diagnostics {
namespace {

// By version. The fields that are read stand in front of each entry.
struct Layout {
  std::size_t head;
  std::size_t umtsCell;
  std::size_t gsmCell;
};
constexpr std::array kLayouts = {Layout{2, 10, 7}, Layout{2, 11, 8}, Layout{7, 16, 13}};

constexpr int kRscpOffset = -21;
constexpr std::uint32_t kArfcnBits = 12;
constexpr std::uint32_t kMostUarfcn = 16'383;
constexpr std::uint32_t kMostScramblingCode = 511;
constexpr std::uint32_t kMostBsic = 63;

int s8At(ByteView body, std::size_t offset) { return static_cast<std::int8_t>(body[offset]); }

std::optional<UmtsNeighbour> umtsCellAt(ByteView body, std::size_t at) {
  UmtsNeighbour cell;
  cell.uarfcn = u16At(body, at);
  cell.scramblingCode = u16At(body, at + 2);
  cell.rscpDbm = s8At(body, at + 4) + kRscpOffset;
  cell.ecnoDb = s8At(body, at + 7) / 2.0;
  if (cell.uarfcn > kMostUarfcn || cell.scramblingCode > kMostScramblingCode) return std::nullopt;
  return cell;
}

UmtsGsmNeighbour gsmCellAt(ByteView body, std::size_t at) {
  UmtsGsmNeighbour cell;
  cell.arfcn = bits(u16At(body, at), 0, kArfcnBits);
  const std::uint32_t bsic = u16At(body, at + 2);
  if (bsic <= kMostBsic) cell.bsic = bsic;
  cell.levelDbm = s8At(body, at + 4);
  return cell;
}

// The serving cell first.
std::optional<UmtsNeighbours> cellsIn(ByteView body, const Layout& layout) {
  if (body.size() < layout.head) return std::nullopt;
  const std::size_t umts = bits(body[0], 0, 6);
  const std::size_t gsm = bits(body[1], 0, 6);
  if (body.size() != layout.head + umts * layout.umtsCell + gsm * layout.gsmCell)
    return std::nullopt;
  UmtsNeighbours cells;
  std::size_t at = layout.head;
  for (std::size_t i = 0; i < umts; ++i, at += layout.umtsCell) {
    const auto cell = umtsCellAt(body, at);
    if (!cell) return std::nullopt;
    cells.umts.push_back(*cell);
  }
  for (std::size_t i = 0; i < gsm; ++i, at += layout.gsmCell)
    cells.gsm.push_back(gsmCellAt(body, at));
  return cells;
}

// All power on the carrier is the pilot's over its share.
UmtsSignal signalOf(const UmtsNeighbour& serving, std::uint64_t timeMs) {
  UmtsSignal signal;
  signal.rscpDbm = UmtsLevel{serving.rscpDbm, timeMs};
  signal.ecnoDb = UmtsLevel{serving.ecnoDb, timeMs};
  signal.rssiDbm[0] = UmtsLevel{serving.rscpDbm - serving.ecnoDb, timeMs};
  return signal;
}

}  // namespace

std::optional<unsigned> versionOfUmtsRanks(ByteView body) {
  return body.empty() ? std::nullopt : std::optional<unsigned>(bits(body[0], 6, 2));
}

Outcome readUmtsRanks(const LogPacket& packet, Picture& picture, Told& told) {
  const auto version = versionOfUmtsRanks(packet.body);
  if (!version) return Outcome::damaged;
  if (*version >= kLayouts.size()) return Outcome::unknownVersion;
  auto cells = cellsIn(packet.body, kLayouts[*version]);
  if (!cells) return Outcome::damaged;
  if (cells->umts.empty()) return Outcome::understood;  // no serving cell
  changeTo(picture, Technology::umts);
  picture.umts.signal = signalOf(cells->umts.front(), packet.timeMs);
  cells->umts.erase(cells->umts.begin());
  cells->timeMs = packet.timeMs;
  picture.umts.neighbours = std::move(*cells);
  told.tell(metric::kUmtsServingMeasurement);
  told.tell(metric::kUmtsNeighbours);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
