#include "sources/MetricKeeper.h"

#include <algorithm>
#include <utility>

namespace qel::sources {
namespace {

constexpr std::chrono::seconds kSecond{1};

}  // namespace

void MetricKeeper::update(const Build& build, std::uint64_t timeMs, Clock::time_point now,
                          const Send& send) {
  std::vector<SourceEvent> due;
  {
    const std::lock_guard lock(_mutex);
    for (const Row& row : _rows) {
      if (auto event = dueOf(row, build, timeMs, now)) due.push_back(std::move(*event));
    }
  }
  for (const SourceEvent& event : due) send(event);
}

void MetricKeeper::update(std::span<const std::uint32_t> metrics, const Build& build,
                          std::uint64_t timeMs, Clock::time_point now, const Send& send) {
  for (const std::uint32_t metric : metrics) {
    const auto row = std::ranges::find(_rows, metric, &Row::metric);
    if (row == _rows.end()) continue;
    std::optional<SourceEvent> due;
    {
      const std::lock_guard lock(_mutex);
      due = dueOf(*row, build, timeMs, now);
    }
    if (due) send(*due);
  }
}

std::optional<SourceEvent> MetricKeeper::dueOf(const Row& row, const Build& build,
                                               std::uint64_t timeMs, Clock::time_point now) {
  if (!maySend(row, now)) return std::nullopt;
  auto value = build(row.metric, 0);
  if (!value) {
    _kept.erase(row.metric);
    return std::nullopt;
  }
  Kept& kept = _kept[row.metric];
  if (kept.sentAt && kept.value == *value && now < *kept.sentAt + _period) return std::nullopt;
  kept.value = std::move(*value);
  kept.sentAt = now;
  kept.event = metricEvent(row.metric, *build(row.metric, timeMs), timeMs);
  if (row.mostPerSecond > 0) ++_rates[row.metric].sent;
  return kept.event;
}

bool MetricKeeper::maySend(const Row& row, Clock::time_point now) {
  if (row.mostPerSecond == 0) return true;
  Rate& rate = _rates[row.metric];
  if (now >= rate.since + kSecond) rate = {now, 0, false};
  rate.waits = rate.sent >= row.mostPerSecond;
  return !rate.waits;
}

void MetricKeeper::clear() {
  const std::lock_guard lock(_mutex);
  _kept.clear();
  _rates.clear();
}

void MetricKeeper::sendAll() {
  const std::lock_guard lock(_mutex);
  for (auto& [metric, kept] : _kept) kept.sentAt.reset();
  _rates.clear();
}

MetricKeeper::Clock::time_point MetricKeeper::due() const {
  const std::lock_guard lock(_mutex);
  auto due = Clock::time_point::max();
  for (const auto& [metric, kept] : _kept) {
    due = std::min(due, kept.sentAt ? *kept.sentAt + _period : Clock::time_point());
  }
  return due;
}

MetricKeeper::Clock::time_point MetricKeeper::waitingUntil() const {
  const std::lock_guard lock(_mutex);
  auto until = Clock::time_point::max();
  for (const auto& [metric, rate] : _rates) {
    if (rate.waits) until = std::min(until, rate.since + kSecond);
  }
  return until;
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
