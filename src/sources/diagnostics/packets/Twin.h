// Modems with two SIM cards have a second code for many logs: the same log behind one more byte.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

// The byte names the subscription, from 0 on. Without a wrapper that has already told one radio
// from the other, only the first one's is read.
template <ReadLog read>
Outcome readTwin(const LogPacket& packet, Picture& picture, Told& told) {
  if (packet.body.empty()) return Outcome::damaged;
  if (packet.radio == 0 && packet.body[0] != 0) return Outcome::notOurs;
  LogPacket inner = packet;
  inner.body = packet.body.subspan(1);
  return read(inner, picture, told);
}

}  // namespace qel::diagnostics
