// The phone's report to the network during a call (44.018, clauses 9.1.21 and 10.5.2.20).
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace qel::diagnostics {

struct MeasurementReport {
  bool valid = false;           // else the rest means nothing
  std::uint32_t rxlevSub = 0;   // dBm + 110
  std::uint32_t rxqualSub = 0;  // 0, the best, to 7
};

// From the protocol discriminator on; nothing when it is too short.
inline std::optional<MeasurementReport> readMeasurementReport(ByteView message) {
  constexpr std::size_t kResults = 2;
  constexpr std::size_t kResultBytes = 16;
  if (message.size() < kResults + kResultBytes) return std::nullopt;
  const ByteView results = message.subspan(kResults);
  return MeasurementReport{(results[1] & 0x40) == 0, results[1] & 0x3FU, results[2] >> 1 & 7U};
}

}  // namespace qel::diagnostics
