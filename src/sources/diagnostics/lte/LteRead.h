// The way of every LTE log packet that one layout describes whole.
#pragma once

#include "sources/diagnostics/layouts/Layout.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/LtePicture.h"

namespace qel::diagnostics {

// Hands what was read to `take`, which says whether it can be.
template <class Take>
Outcome readWhole(const LogPacket& packet, Take take) {
  if (packet.body.empty()) return Outcome::damaged;
  const Layout* layout = findLayout(packet.code, 0, packet.body[0]);
  if (!layout) return Outcome::unknownVersion;
  const auto reading = read(*layout, packet.body);
  return reading ? take(*reading) : Outcome::damaged;
}

inline void follow(LteLogState& state, Outcome outcome) {
  if (outcome == Outcome::understood) state = LteLogState::isRead;
  if (outcome == Outcome::unknownVersion && state == LteLogState::notSeen) {
    state = LteLogState::isUnread;
  }
}

inline LteCellName nameOf(const Values& values) {
  return {values.number(Field::earfcn), values.number(Field::pci)};
}

}  // namespace qel::diagnostics
