// What is known of LTE's cells and carriers, as metrics. Nothing when it is not known.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> lteCell(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteNeighbours(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteCarriers(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteComponents(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
