// The neighbours that reports list.
#pragma once

#include <cstdint>
#include <span>
#include <vector>

#include "history/History.h"

namespace qel {

// The metrics that list neighbours while the technology is in use.
std::span<const std::int64_t> neighbourMetrics(Technology inUse);
inline constexpr std::size_t kNeighbourMetrics = 4;

// Those of one report, in dBm and dB, in the order of its lists. None when it is no such metric.
std::vector<Neighbour> neighboursIn(const JournalEntry& report);

}  // namespace qel
