// The neighbours that the modem measures on LTE, idle and connected.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

// 0xB192 and 0xB195: on any channel.
Outcome readLteIdleNeighbours(const LogPacket& packet, Picture& picture, Told& told);
Outcome readLteConnectedNeighbours(const LogPacket& packet, Picture& picture, Told& told);
std::optional<unsigned> lteIdleNeighboursVersion(ByteView body);
std::optional<unsigned> lteConnectedNeighboursVersion(ByteView body);

// 0xB179 and 0xB180: on the serving cell's channel, or a secondary carrier's.
Outcome readLteConnectedCells(const LogPacket& packet, Picture& picture, Told& told);
Outcome readLteIdleIntra(const LogPacket& packet, Picture& picture, Told& told);

// 0xB17F: where the phone camps.
Outcome readLteIdleServing(const LogPacket& packet, Picture& picture, Told& told);

}  // namespace qel::diagnostics
