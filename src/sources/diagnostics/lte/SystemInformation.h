// An LTE cell's rules of access and reselection (54030).
#pragma once

#include <cstdint>
#include <optional>

#include "rrc/lte/Messages.h"
#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// Keeps the blocks that the message carries.
void takeSystemInformation(const rrc::LteMessage& message, const LteCellName& cell,
                           Picture& picture, Told& told);

std::optional<Bytes> lteRules(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
