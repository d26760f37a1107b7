// How strongly the phone hears its cell and its neighbours.
#include <vector>

#include "sources/Metrics.h"
#include "sources/diagnostics/gsm/Carriers.h"
#include "sources/diagnostics/gsm/GsmChanges.h"
#include "sources/diagnostics/gsm/GsmLogs.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

constexpr std::size_t kMostCells = 64;

// Sixteenths of a dBm.
double levelAt(ByteView body, std::size_t offset) { return s16At(body, offset) / 16.0; }

// What no receiver measures.
bool isLevel(double dbm) { return dbm >= -140 && dbm <= 0; }

// During a call the metric of idle mode has no value.
void setIdleLevel(Picture& picture, Told& told, const GsmIdleLevel& level) {
  if (picture.gsm.dedicated.value_or(false)) return;
  picture.gsm.idleLevel = level;
  told.tell(metric::kGsmIdleMeasurement);
}

void setNeighbours(Picture& picture, Told& told, const std::vector<GsmNeighbour>& cells) {
  if (!picture.gsm.neighbours) picture.gsm.neighbours.emplace();
  for (const GsmNeighbour& cell : cells) addNeighbour(picture.gsm, cell);
  told.tell(metric::kGsmNeighbours);
}

// Four bursts of one block, in frames one behind the other.
Outcome readBursts(ByteView bursts, const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBursts = 4;
  constexpr std::size_t kLeastBytes = 12;
  constexpr std::uint32_t kFrames = 26 * 51 * 2048;  // after them their number begins anew
  constexpr std::uint32_t kMostApart = 26;
  if (bursts.size() % kBursts != 0 || bursts.size() < kBursts * kLeastBytes) {
    return Outcome::damaged;
  }
  const std::size_t stride = bursts.size() / kBursts;
  const std::uint32_t first = u32At(bursts, 0);
  const GsmCarrier carrier = carrierOf(u16At(bursts, 4));
  double sumDbm = 0;
  for (std::size_t i = 0; i < kBursts; ++i) {
    const ByteView burst = bursts.subspan(i * stride, stride);
    const std::uint32_t frame = u32At(burst, 0);
    const double levelDbm = levelAt(burst, 10);
    if (frame >= kFrames || (frame + kFrames - first) % kFrames > kMostApart) {
      return Outcome::damaged;
    }
    if (!isLevel(levelDbm)) return Outcome::damaged;
    sumDbm += levelDbm;
  }
  setIdleLevel(picture, told, {sumDbm / kBursts, carrier.arfcn, packet.timeMs});
  return Outcome::understood;
}

}  // namespace

Outcome readGsmMonitoredCells(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kCellBytes = 12;
  const ByteView body = packet.body;
  if (body.empty() || body[0] > kMostCells) return Outcome::damaged;
  if (body.size() - 1 < body[0] * kCellBytes) return Outcome::damaged;
  std::vector<GsmNeighbour> cells;
  for (std::size_t i = 0; i < body[0]; ++i) {
    const ByteView cell = body.subspan(1 + i * kCellBytes, kCellBytes);
    GsmNeighbour neighbour{carrierOf(u16At(cell, 0)).arfcn, std::nullopt, levelAt(cell, 2),
                           packet.timeMs};
    if (cell[4] != 0) neighbour.bsic = cell[5] & 0x3FU;
    if (isLevel(neighbour.levelDbm)) cells.push_back(neighbour);
  }
  setNeighbours(picture, told, cells);
  return Outcome::understood;
}

// The head of the serving cell is longer on some modems; the length tells which one it is.
Outcome readGsmReselectionLevels(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kCellBytes = 25;
  const ByteView body = packet.body;
  constexpr std::uint8_t kMostRxlev = 63;
  const auto isHeard = [](ByteView cell) { return cell[5] <= kMostRxlev; };
  const auto levelDbm = [](ByteView cell) { return cell[5] - 110.5; };
  for (const std::size_t headBytes : {std::size_t{26}, std::size_t{28}}) {
    if (body.size() < headBytes) break;
    const std::size_t count = body[headBytes - 1];
    if (count > kMostCells || body.size() != headBytes + count * kCellBytes) continue;
    if (!isHeard(body)) return Outcome::damaged;
    std::vector<GsmNeighbour> cells;
    for (std::size_t i = 0; i < count; ++i) {
      const ByteView cell = body.subspan(headBytes + i * kCellBytes, kCellBytes);
      if (!isHeard(cell)) continue;
      cells.push_back({carrierOf(u16At(cell, 0)).arfcn, {}, levelDbm(cell), packet.timeMs});
    }
    setIdleLevel(picture, told, {levelDbm(body), carrierOf(u16At(body, 0)).arfcn, packet.timeMs});
    setNeighbours(picture, told, cells);
    return Outcome::understood;
  }
  return Outcome::damaged;
}

Outcome readGsmBursts(const LogPacket& packet, Picture& picture, Told& told) {
  if (packet.body.empty()) return Outcome::damaged;
  return readBursts(packet.body.subspan(1), packet, picture, told);
}

Outcome readGsmVersionedBursts(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::uint8_t kVersion = 4;
  constexpr std::size_t kHeadBytes = 2;
  constexpr std::size_t kBurstsBytes = 4 * 37;
  const ByteView body = packet.body;
  if (body.empty()) return Outcome::damaged;
  if (body[0] != kVersion) return Outcome::unknownVersion;
  if (body.size() < kHeadBytes + kBurstsBytes) return Outcome::damaged;
  return readBursts(body.subspan(kHeadBytes, kBurstsBytes), packet, picture, told);
}

Outcome readGsmServingLevel(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 3;
  if (packet.body.size() < kBytes) return Outcome::damaged;
  const double levelDbm = levelAt(packet.body, 0);
  if (!isLevel(levelDbm)) return Outcome::damaged;
  const GsmCamp* camp = picture.gsm.ownCamp();
  const auto arfcn = camp ? std::optional(camp->carrier.arfcn) : std::nullopt;
  setIdleLevel(picture, told, {levelDbm, arfcn, packet.timeMs});
  return Outcome::understood;
}

Outcome readGsmNeighbourLevels(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kCellBytes = 4;
  const ByteView body = packet.body;
  if (body.empty() || body[0] > kMostCells) return Outcome::damaged;
  if (body.size() - 1 < body[0] * kCellBytes) return Outcome::damaged;
  std::vector<GsmNeighbour> cells;
  for (std::size_t i = 0; i < body[0]; ++i) {
    const std::size_t offset = 1 + i * kCellBytes;
    const double levelDbm = levelAt(body, offset + 2);
    if (!isLevel(levelDbm)) continue;
    cells.push_back({carrierOf(u16At(body, offset)).arfcn, {}, levelDbm, packet.timeMs});
  }
  setNeighbours(picture, told, cells);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
