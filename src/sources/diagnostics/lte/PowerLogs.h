// What the phone sends on LTE: the shared channel (0xB16E) and the control channel (0xB16F).
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readLtePusch(const LogPacket& packet, Picture& picture, Told& told);
Outcome readLtePucch(const LogPacket& packet, Picture& picture, Told& told);

}  // namespace qel::diagnostics
