// The logs that tell about registration in 2G and 3G, one reader each.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readGmmState(const LogPacket& packet, Picture& picture, Told& told);            // 7130
Outcome readMmState(const LogPacket& packet, Picture& picture, Told& told);             // 7131
Outcome readMmArea(const LogPacket& packet, Picture& picture, Told& told);              // 7135
Outcome readDynamicIdentity(const LogPacket& packet, Picture& picture, Told& told);     // 7138
Outcome readMobileMessage(const LogPacket& packet, Picture& picture, Told& told);       // 713A
Outcome readEquivalentNetworks(const LogPacket& packet, Picture& picture, Told& told);  // 7150

}  // namespace qel::diagnostics
