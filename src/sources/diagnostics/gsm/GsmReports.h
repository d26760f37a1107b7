// The metrics of GSM.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> gsmCellReport(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> gsmIdleConfigReport(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> gsmIdleLevelReport(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> gsmCallReport(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> gsmPacketConfigReport(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> gsmNeighboursReport(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
