// How LTE is received and sent, as metrics. Nothing when it is not known.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> lteMeasurement(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteQuality(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteTxPower(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
