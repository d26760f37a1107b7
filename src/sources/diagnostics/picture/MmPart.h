// What is known of registration in the circuit-switched domain.
#pragma once

#include <cstdint>
#include <optional>

#include "sources/diagnostics/packets/Plmn.h"

namespace qel::diagnostics {

// Codes are those of the report on it (54538).
struct MmPart {
  std::optional<std::int32_t> registration;
  std::optional<std::int32_t> updateStatus;
  std::optional<LocationArea> area;
  std::optional<std::uint32_t> tmsi;
  std::optional<std::uint32_t> periodicUpdateS;  // T3212; 0: never
  std::optional<std::int32_t> failureCause;
  std::optional<std::int32_t> rejectCause;
  std::optional<bool> combined;  // the last procedure was for both domains
};

}  // namespace qel::diagnostics
