// The serving cell and the state of the connection.
#include "sources/Metrics.h"
#include "sources/diagnostics/packets/Bits.h"
#include "sources/diagnostics/umts/UmtsConnectionSteps.h"
#include "sources/diagnostics/umts/UmtsReaders.h"

namespace qel::diagnostics {
namespace {

constexpr std::size_t kCellLength = 32;
constexpr std::uint32_t kMostUarfcn = 16'383;
constexpr std::uint32_t kMostScramblingCode = 511;
constexpr std::uint32_t kMostCellId = 0x0FFFFFFF;
constexpr std::uint32_t kMostAreaCode = 0xFFFF;

// A digit a byte; 15 in the place of a third one: there are two.
std::optional<Network> networkAt(ByteView body, std::size_t offset) {
  constexpr unsigned kNoDigit = 15;
  Network network;
  for (std::size_t i = 0; i < 3; ++i) {
    if (body[offset + i] > 9) return std::nullopt;
    network.mcc = network.mcc * 10 + body[offset + i];
  }
  for (std::size_t i = 3; i < 6; ++i) {
    if (i == 5 && body[offset + i] == kNoDigit) break;
    if (body[offset + i] > 9) return std::nullopt;
    network.mnc = network.mnc * 10 + body[offset + i];
    ++network.mncDigits;
  }
  return network;
}

std::optional<UmtsCell> cellIn(ByteView body) {
  if (body.size() != kCellLength) return std::nullopt;
  UmtsCell cell;
  cell.uarfcn = u32At(body, 4);
  cell.cellId = u32At(body, 8);
  cell.scramblingCode = u16At(body, 16) >> 4;
  cell.network = networkAt(body, 18);
  cell.areaCode = u32At(body, 24);
  const bool possible = cell.uarfcn <= kMostUarfcn && cell.cellId <= kMostCellId &&
                        cell.scramblingCode <= kMostScramblingCode &&
                        cell.areaCode <= kMostAreaCode;
  return possible ? std::optional(cell) : std::nullopt;
}

// Its system information may have been read before the phone settled on it.
void settleOn(const UmtsCell& cell, UmtsPicture& umts) {
  if (umts.cell && umts.cell->sameAs(cell)) {
    umts.cell = cell;
    return;
  }
  const auto& selection = umts.broadcast.selection;
  if (!selection || selection->block.cellId != cell.cellId) umts.broadcast = {};
  umts.cell = cell;
  umts.signal = {};
  umts.neighbours.reset();
}

std::optional<UmtsState> stateOf(unsigned code, bool elsewhere) {
  switch (code) {
    case 0:
      return elsewhere ? UmtsState::inactive : UmtsState::idle;
    case 1:
      return UmtsState::establish;
    case 2:
      return UmtsState::cellFach;
    case 3:
      return UmtsState::cellDch;
    case 4:
      return UmtsState::cellPch;
    case 5:
      return UmtsState::uraPch;
    default:
      return std::nullopt;
  }
}

}  // namespace

Outcome readUmtsCell(const LogPacket& packet, Picture& picture, Told& told) {
  const auto cell = cellIn(packet.body);
  if (!cell) return Outcome::damaged;
  settleOn(*cell, picture.umts);
  changeTo(picture, Technology::umts);
  told.tell(metric::kUmtsCellInfo);
  return Outcome::understood;
}

Outcome readUmtsState(const LogPacket& packet, Picture& picture, Told& told) {
  if (packet.body.empty()) return Outcome::damaged;
  const bool elsewhere = picture.technology && *picture.technology != Technology::umts;
  const auto state = stateOf(packet.body[0], elsewhere);
  if (!state) return Outcome::damaged;
  enter(*state, picture.umts.connection);
  if (picture.umts.connection.connected().value_or(false)) changeTo(picture, Technology::umts);
  told.tell(metric::kUmtsRrcState);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
