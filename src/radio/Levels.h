// Levels in dBm and qualities in dB as the reports carry them.
#pragma once

#include <algorithm>
#include <cmath>
#include <cstdint>

namespace qel {

inline std::int32_t rounded(double value) { return static_cast<std::int32_t>(std::lround(value)); }

// What lies beyond the ends of an index stands at them.
inline std::uint32_t index(double value, int highest) {
  return static_cast<std::uint32_t>(std::clamp(rounded(value), 0, highest));
}
inline std::uint32_t rsrpIndex(double dbm) { return index(dbm + 140, 97); }       // 36.133, 9.1.4
inline std::uint32_t rsrqIndex(double db) { return index((db + 19.5) * 2, 34); }  // 36.133, 9.1.7
inline std::uint32_t rscpIndex(double dbm) { return index(dbm + 116, 91); }       // 25.133, 9.1.1.3
inline std::uint32_t ecnoIndex(double db) { return index((db + 24.5) * 2, 49); }  // 25.133, 9.1.2.3
inline std::uint32_t rxlevIndex(double dbm) { return index(dbm + 110, 63); }      // 45.008, 8.1.4

}  // namespace qel
