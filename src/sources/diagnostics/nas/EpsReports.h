// The metrics of registration in LTE, of packet connections, and of networks and areas.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> emmContext(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> packetConnections(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> networksAndAreas(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
