// What is known of registration in the packet domain of 2G and 3G.
#pragma once

#include <cstdint>
#include <optional>

#include "sources/diagnostics/packets/Plmn.h"

namespace qel::diagnostics {

// Codes are those of the report on it (54539).
struct GmmPart {
  std::optional<std::int32_t> registration;
  std::optional<std::int32_t> updateStatus;
  std::optional<RoutingArea> area;
  std::optional<std::uint32_t> pTmsi;
  std::optional<std::uint32_t> periodicUpdateS;  // T3312; 0: never
  std::optional<std::int32_t> failureCause;
  std::optional<std::int32_t> rejectCause;
  std::optional<std::int32_t> procedure;
};

}  // namespace qel::diagnostics
