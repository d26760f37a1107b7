// What is known of registration in LTE (24.301).
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "sources/diagnostics/picture/CommonPart.h"

namespace qel::diagnostics {

struct TemporaryIdentity {   // GUTI, without the network's code
  std::uint32_t group = 0;   // 16 bits
  std::uint32_t entity = 0;  // 8 bits
  std::uint32_t mTmsi = 0;
};

// Codes are those of the report on it (54540).
struct EmmPart {
  std::optional<std::int32_t> registration;
  bool registrationIsModems = false;  // else it follows from messages
  std::optional<std::int32_t> updateStatus;
  std::vector<TrackingArea> areas;
  std::optional<TemporaryIdentity> identity;
  std::optional<std::uint32_t> rejectCause;
  std::optional<std::int32_t> procedure;
  std::optional<std::uint32_t> periodicUpdateS;  // T3412; 0: never
  std::optional<bool> voiceOverIms;
  std::optional<bool> emergencyBearers;
};

}  // namespace qel::diagnostics
