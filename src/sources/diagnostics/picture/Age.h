// How long what was measured holds. Times are milliseconds since 1970.
#pragma once

#include <cstdint>

namespace qel::diagnostics {

inline constexpr std::uint64_t kSignalMs = 10'000;
inline constexpr std::uint64_t kNeighbourMs = 30'000;

// A clock that was set backwards makes all that was before it too old.
constexpr bool isOld(std::uint64_t timeMs, std::uint64_t nowMs, std::uint64_t mostMs) {
  return (nowMs > timeMs ? nowMs - timeMs : timeMs - nowMs) > mostMs;
}

}  // namespace qel::diagnostics
