// Which cell serves on LTE, and what cells say of themselves.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

// 0xB0C2: the serving cell. 0xB0C1 and 0xB197: the bandwidth of a cell that was heard.
Outcome readLteServingCell(const LogPacket& packet, Picture& picture, Told& told);
Outcome readLteBroadcast(const LogPacket& packet, Picture& picture, Told& told);

// 1611: the phone is on another cell, of which nothing else is known yet.
Outcome readLteNewCell(const ModemEvent& event, Picture& picture, Told& told);

}  // namespace qel::diagnostics
