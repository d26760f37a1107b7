#include "sources/modem_manager/MetricKeeper.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "sources/modem_manager/ModemReports.h"

namespace qel::sources {
void MetricKeeper::update(const std::optional<ModemPicture>& modem, std::uint64_t timeMs,
                          Clock::time_point now, const Send& send) {
  std::vector<SourceEvent> due;
  {
    const std::lock_guard lock(_mutex);
    for (const ModemReportRow& row : modemReports()) {
      auto value = modem ? row.build(*modem, 0) : std::nullopt;
      if (!value) {
        _kept.erase(row.metric);
        continue;
      }
      Kept& kept = _kept[row.metric];
      if (kept.sentAt && kept.value == *value && now < *kept.sentAt + _period) continue;
      kept.value = std::move(*value);
      kept.sentAt = now;
      kept.event = metricEvent(row.metric, *row.build(*modem, timeMs), timeMs);
      due.push_back(kept.event);
    }
  }
  for (const SourceEvent& event : due) send(event);
}

void MetricKeeper::sendAll() {
  const std::lock_guard lock(_mutex);
  for (auto& [metric, kept] : _kept) kept.sentAt.reset();
}

MetricKeeper::Clock::time_point MetricKeeper::due() const {
  const std::lock_guard lock(_mutex);
  auto due = Clock::time_point::max();
  for (const auto& [metric, kept] : _kept) {
    due = std::min(due, kept.sentAt ? *kept.sentAt + _period : Clock::time_point());
  }
  return due;
}

SourceAnswer MetricKeeper::query(std::uint32_t metric) const {
  const std::lock_guard lock(_mutex);
  const auto found = _kept.find(metric);
  if (found == _kept.end()) {
    return {
        false, "metric " + std::to_string(metric) + " has no value that the modem gives", 0, {}};
  }
  return {true, "", found->second.event.timeMs, found->second.event.entries};
}

}  // namespace qel::sources
