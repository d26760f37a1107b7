// 0xB0C0: LTE's RRC messages as they went over the air.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readLteOverTheAir(const LogPacket& packet, Picture& picture, Told& told);

}  // namespace qel::diagnostics
