#include "sources/combined/MetricArbiter.h"

#include <utility>

namespace qel::sources {

bool MetricArbiter::lets(SourcePart part, const SourceEvent& event) {
  const auto metric = metricOf(event);
  if (!metric) return true;
  Entry& entry = _entries[*metric];
  if (part == betterPart(*metric)) {
    entry = {true, {}};
    return true;
  }
  if (entry.isHeld) entry.withheld = event;
  return !entry.isHeld;
}

std::vector<SourceEvent> MetricArbiter::lose(SourcePart part) {
  std::vector<SourceEvent> instead;
  for (auto& [metric, entry] : _entries) {
    if (part == betterPart(metric)) {
      if (entry.withheld) instead.push_back(std::move(*entry.withheld));
      entry = {};
    } else {
      entry.withheld.reset();
    }
  }
  return instead;
}

}  // namespace qel::sources
