// The metrics of a modem on UMTS, each from what is known; nothing when nothing is.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> umtsRrcState(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> umtsRrcConfiguration(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> umtsCell(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> umtsSignal(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> umtsTransmitPower(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> umtsReselection(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> umtsNeighbours(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
