// What the network configures for a connection of LTE: reception, secondary carriers, measurements.
#pragma once

#include <cstdint>

#include "rrc/lte/Messages.h"
#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

void takeConfiguration(const rrc::LteMessage& message, std::uint64_t timeMs, Picture& picture,
                       Told& told);

}  // namespace qel::diagnostics
