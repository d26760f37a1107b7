// How LTE's serving cell and secondary carriers are received (0xB193).
#pragma once

#include "sources/diagnostics/PacketTable.h"

namespace qel::diagnostics {

Outcome readLteMeasurement(const LogPacket& packet, Picture& picture, Told& told);
std::optional<unsigned> lteMeasurementVersion(ByteView body);

}  // namespace qel::diagnostics
