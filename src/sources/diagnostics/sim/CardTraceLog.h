// The log of what modem and card say to each other, byte by byte: 0x1098.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readCardTrace(const LogPacket& packet, Picture& picture, Told& told);

}  // namespace qel::diagnostics
