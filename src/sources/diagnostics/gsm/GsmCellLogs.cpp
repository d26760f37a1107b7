// What the modem says of its cell in its own words.
#include "sources/Metrics.h"
#include "sources/diagnostics/gsm/Carriers.h"
#include "sources/diagnostics/gsm/GsmChanges.h"
#include "sources/diagnostics/gsm/GsmLogs.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {

Outcome readGsmCell(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 13;
  constexpr std::uint32_t kMostColour = 7;
  const ByteView body = packet.body;
  if (body.size() < kBytes) return Outcome::damaged;
  const std::uint32_t stationColour = body[2];
  const std::uint32_t networkColour = body[3];
  GsmCamp own;
  own.carrier = carrierOf(u16At(body, 0));
  own.cell = {locationAreaAt(body, 6), u16At(body, 4)};
  own.bsic = networkColour << 3 | stationColour;
  if (stationColour > kMostColour || networkColour > kMostColour) return Outcome::damaged;
  if (!networkOf(own.cell.area.plmn)) return Outcome::damaged;
  camp(picture, own.cell);
  picture.gsm.camp = own;
  told.tell(metric::kGsmScellInfo);
  return Outcome::understood;
}

// Of the twelve numbers those are read whose unit is certain.
Outcome readGsmReselectionParameters(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 12;
  constexpr std::uint32_t kMostPowerLevel = 31;
  constexpr std::uint32_t kMostRxlev = 63;
  const ByteView body = packet.body;
  if (body.size() < kBytes) return Outcome::damaged;
  if (body[1] > kMostPowerLevel || body[2] > kMostRxlev) return Outcome::damaged;
  for (const std::uint8_t flag : body.subspan(5, 4)) {
    if (flag > 1) return Outcome::damaged;
  }
  GsmBroadcast& broadcast = picture.gsm.broadcast;
  GsmSelection selection = broadcast.selection.value_or(GsmSelection{});
  selection.mostPowerLevel = body[1];
  selection.leastRxlev = body[2];
  selection.halfRate = body[5] != 0;
  broadcast.selection = selection;
  GsmReselection reselection = broadcast.reselection.value_or(GsmReselection{});
  reselection.given = body[7] != 0;
  if (reselection.given) reselection.qualify = body[8] != 0;
  broadcast.reselection = reselection;
  told.tell(metric::kGsmIdleConfig);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
