// The logs that tell about UMTS, each by its own reader. What each takes is in its packet whole.
#pragma once

#include <optional>

#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

Outcome readUmtsCell(const LogPacket& packet, Picture& picture, Told& told);         // 0x4127
Outcome readUmtsState(const LogPacket& packet, Picture& picture, Told& told);        // 0x4125
Outcome readUmtsRanks(const LogPacket& packet, Picture& picture, Told& told);        // 0x4005
Outcome readUmtsGainControl(const LogPacket& packet, Picture& picture, Told& told);  // 0x4176
Outcome readUmtsRrcMessage(const LogPacket& packet, Picture& picture, Told& told);   // 0x412F

// The two highest bits of the first byte.
std::optional<unsigned> versionOfUmtsRanks(ByteView body);

}  // namespace qel::diagnostics
