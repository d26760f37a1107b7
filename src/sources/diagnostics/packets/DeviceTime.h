// The modem's time stamps.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

// Bits 16-63 count 1.25 ms since 1980-01-06 00:00, bits 0-15 the 49152nd parts of that. In
// milliseconds since 1970-01-01 00:00, as the modem's clock goes: some go by GPS time.
constexpr std::uint64_t deviceTimeMs(std::uint64_t stamp) {
  constexpr std::uint64_t kEpochMs = 315'964'800'000;
  constexpr std::uint64_t kStepUs = 1250;
  constexpr std::uint64_t kParts = 49152;
  return kEpochMs + ((stamp >> 16) * kStepUs + (stamp & 0xFFFF) * kStepUs / kParts) / 1000;
}

}  // namespace qel::diagnostics
