#include "service/sources/modem_manager/MetricKeeper.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "messages/catalogue/KBBMetricUtility.h"
#include "service/sources/modem_manager/ModemReports.h"
#include "tesk/Constants.h"

namespace qel::service {
namespace {

ServiceEvent eventOf(std::uint32_t metric, Bytes payload, std::uint64_t timeMs) {
  return {timeMs,
          tesk::kEventMetric,
          {{tesk::kKeyMetricID, std::int64_t{metric} + std::int64_t{kMetricEventBase}},
           {tesk::kKeyProfileID, std::int64_t{0}},
           {tesk::kKeyPayload, std::move(payload)}}};
}

}  // namespace

void MetricKeeper::update(const std::optional<ModemPicture>& modem, std::uint64_t timeMs,
                          Clock::time_point now, const Send& send) {
  std::vector<ServiceEvent> due;
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
      kept.event = eventOf(row.metric, *row.build(*modem, timeMs), timeMs);
      due.push_back(kept.event);
    }
  }
  for (const ServiceEvent& event : due) send(event);
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
    return {CommandCode::metricNotAvailable,
            "metric " + std::to_string(metric) + " has no value that the modem gives",
            0,
            {}};
  }
  return {CommandCode::done, "", found->second.event.timeMs, found->second.event.entries};
}

}  // namespace qel::service
