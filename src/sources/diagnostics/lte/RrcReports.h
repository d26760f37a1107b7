// What is known of LTE's connection, as metrics. Nothing when it is not known.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

std::optional<Bytes> lteRrcState(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteRadioLinkFailure(const Picture& picture, std::uint64_t timeMs);
std::optional<Bytes> lteReception(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
