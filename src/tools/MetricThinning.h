// Fewer events of each metric.
#pragma once

#include <cstdint>
#include <map>
#include <optional>

#include "sources/SourceEvent.h"

namespace qel::tools {

// Lets of each metric one event through in so many seconds of the events' times, or every one.
class MetricThinning {
 public:
  explicit MetricThinning(std::optional<double> everyS) {
    if (everyS) _everyMs = static_cast<std::uint64_t>(*everyS * 1000);
  }

  bool lets(const sources::SourceEvent& event) {
    if (_everyMs == 0) return true;
    const auto [last, isFirst] = _lastMs.emplace(sources::metricOf(event), event.timeMs);
    // A clock that was set back begins anew.
    const bool isDue = event.timeMs < last->second || event.timeMs - last->second >= _everyMs;
    if (isDue) last->second = event.timeMs;
    return isFirst || isDue;
  }

 private:
  std::uint64_t _everyMs = 0;
  std::map<std::optional<std::uint32_t>, std::uint64_t> _lastMs;  // by metric
};

}  // namespace qel::tools
