#include "sources/diagnostics/sim/CardTraceLog.h"

#include "sources/diagnostics/sim/CardCommands.h"

namespace qel::diagnostics {
namespace {

using Phase = CardExchange::Phase;

// A command, or the first of one after a piece was lost.
void takeHeaderByte(std::uint8_t byte, SimPicture& sim) {
  CardExchange& exchange = sim.exchange;
  if (exchange.phase != Phase::header) loseTrack(sim);
  exchange.header[exchange.headerBytes++] = byte;
  if (exchange.headerBytes < CardExchange::kHeaderBytes) return;
  exchange.phase = Phase::procedure;
  exchange.kept = isDataKept(sim);
}

// The card speaks first when it is switched on.
void takeCardsOwnByte(std::uint8_t byte, SimPicture& sim) {
  constexpr std::uint8_t kDirect = 0x3B;
  constexpr std::uint8_t kInverse = 0x3F;
  const bool reset = sim.exchange.headerBytes == 0 && (byte == kDirect || byte == kInverse);
  if (reset) takeReset(sim);
  if (sim.exchange.headerBytes != 0) loseTrack(sim);
}

// What the card answers between the pieces of a command (ISO/IEC 7816-3, clause 10.3.3).
void takeProcedureByte(std::uint8_t byte, SimPicture& sim) {
  CardExchange& exchange = sim.exchange;
  constexpr std::uint8_t kWait = 0x60;
  const std::uint8_t instruction = exchange.header[1];
  const std::uint8_t high = byte & 0xF0;
  if (byte == kWait) return;
  if (byte == instruction || byte == (instruction ^ 0xFF)) {
    exchange.oneByte = byte != instruction;
    exchange.phase = Phase::data;
  } else if (high == 0x60 || high == 0x90) {
    exchange.firstStatus = byte;
    exchange.phase = Phase::status;
  } else {
    loseTrack(sim);
    takeCardsOwnByte(byte, sim);
  }
}

void takeDataByte(bool fromCard, std::uint8_t byte, SimPicture& sim) {
  CardExchange& exchange = sim.exchange;
  constexpr std::size_t kMostBytes = 256;
  if (exchange.transferred == 0) exchange.toCard = !fromCard;
  if (exchange.toCard && fromCard) return loseTrack(sim);
  if (!exchange.toCard && !fromCard) return takeHeaderByte(byte, sim);
  const std::size_t length = exchange.header[4];
  const std::size_t expected = length == 0 && fromCard ? kMostBytes : length;
  if (exchange.transferred >= expected) return loseTrack(sim);
  if (exchange.kept) exchange.data.push_back(byte);
  ++exchange.transferred;
  if (exchange.oneByte || exchange.transferred >= expected) exchange.phase = Phase::procedure;
}

void takeByte(bool fromCard, std::uint8_t byte, Picture& picture, Told& told) {
  CardExchange& exchange = picture.sim.exchange;
  if (exchange.phase == Phase::data) return takeDataByte(fromCard, byte, picture.sim);
  if (!fromCard) return takeHeaderByte(byte, picture.sim);
  switch (exchange.phase) {
    case Phase::header:
      return takeCardsOwnByte(byte, picture.sim);
    case Phase::procedure:
      return takeProcedureByte(byte, picture.sim);
    default:
      takeCommand(picture, told, exchange.firstStatus);
      exchange = {};
  }
}

enum Item : std::uint8_t { kTime = 0x01, kToCard = 0x10, kFromCard = 0x80 };

// Hands each byte that went over the line to `take`; false where an item is none or is cut off.
template <class Take>
bool forEachByte(ByteView items, const Take& take) {
  constexpr std::size_t kTimeBytes = 8;
  while (!items.empty()) {
    const std::uint8_t item = items[0];
    const std::size_t length = item == kTime ? kTimeBytes : 1;
    if (item != kTime && item != kToCard && item != kFromCard) return false;
    if (items.size() <= length) return false;
    if (item != kTime) take(item == kFromCard, items[1]);
    items = items.subspan(1 + length);
  }
  return true;
}

}  // namespace

Outcome readCardTrace(const LogPacket& packet, Picture& picture, Told& told) {
  const ByteView body = packet.body;
  const bool whole = !body.empty() && body.size() - 1 >= body[0];
  const ByteView items = whole ? body.subspan(1, body[0]) : ByteView();
  if (!whole || !forEachByte(items, [](bool, std::uint8_t) {})) {
    loseTrack(picture.sim);
    return Outcome::damaged;
  }
  forEachByte(items,
              [&](bool fromCard, std::uint8_t byte) { takeByte(fromCard, byte, picture, told); });
  return Outcome::understood;
}

}  // namespace qel::diagnostics
