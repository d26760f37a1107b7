// The cells that a phone on LTE reports to its network.
#pragma once

#include <cstdint>
#include <optional>

#include "rrc/lte/Messages.h"
#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

void takeReported(const rrc::lte::MeasurementReport& report, std::uint64_t timeMs, Picture& picture,
                  Told& told);

// The cells of other technologies (54032).
std::optional<Bytes> lteOthers(const Picture& picture, std::uint64_t timeMs);

}  // namespace qel::diagnostics
