// The packets about LTE's session management.
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readEsmMessages(const LogPacket& packet, Picture& picture, Told& told);

// A bearer's state and its quality of service. What their codes for states mean is not known, and
// no metric has the quality of service: their length is looked at, no more.
Outcome readBearerState(const LogPacket& packet, Picture& picture, Told& told);
Outcome readBearerContext(const LogPacket& packet, Picture& picture, Told& told);

}  // namespace qel::diagnostics
