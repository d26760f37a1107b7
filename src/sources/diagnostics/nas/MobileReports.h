// The metrics of registration in 2G and 3G.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> mmContext(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> gmmContext(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
