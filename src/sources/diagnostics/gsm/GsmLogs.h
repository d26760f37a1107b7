// The logs that tell about GSM, one reader each.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readGsmRadioMessage(const LogPacket& packet, Picture& picture, Told& told);  // 512F
Outcome readGsmCell(const LogPacket& packet, Picture& picture, Told& told);          // 5134
Outcome readGsmReselectionParameters(const LogPacket& packet, Picture& picture,
                                     Told& told);                                         // 5130
Outcome readGsmMonitoredCells(const LogPacket& packet, Picture& picture, Told& told);     // 5071
Outcome readGsmReselectionLevels(const LogPacket& packet, Picture& picture, Told& told);  // 51FC
Outcome readGsmBursts(const LogPacket& packet, Picture& picture, Told& told);             // 506C
Outcome readGsmVersionedBursts(const LogPacket& packet, Picture& picture, Told& told);    // 506A
Outcome readGsmServingLevel(const LogPacket& packet, Picture& picture, Told& told);       // 507A
Outcome readGsmNeighbourLevels(const LogPacket& packet, Picture& picture, Told& told);    // 507B

}  // namespace qel::diagnostics
