// The packets about LTE's mobility management.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readEmmState(const LogPacket& packet, Picture& picture, Told& told);
Outcome readEmmFromNetwork(const LogPacket& packet, Picture& picture, Told& told);
Outcome readEmmFromPhone(const LogPacket& packet, Picture& picture, Told& told);

}  // namespace qel::diagnostics
