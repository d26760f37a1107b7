#include "tesk/EventBacklog.h"

#include <algorithm>
#include <utility>

#include "base/Weight.h"
#include "tesk/Constants.h"

namespace tesk {
namespace {

constexpr std::size_t kBytesOfAnEvent = 128;    // beside its entries
constexpr std::size_t kMetricsRemembered = 64;  // more than a phone reports

std::optional<std::int64_t> metricOf(const EventBacklog::Event& event) {
  if (event.name != kEventMetric) return std::nullopt;
  const qel::Value* metric = event.entries.find(kKeyMetricID);
  return metric ? metric->asInt64() : std::nullopt;
}

}  // namespace

bool EventBacklog::add(Event event) {
  const std::size_t bytes = kBytesOfAnEvent + weightOf(event.entries);
  const auto metric = metricOf(event);
  const std::lock_guard lock(_mutex);
  if (bytes > _limits.bytes) {
    ++_dropped;
    return false;
  }
  std::size_t* ofItsMetric = metric ? &_metrics[*metric] : nullptr;
  if (ofItsMetric) ++*ofItsMetric;  // counted first: those before it are not the newest any more
  makeRoom(bytes);
  _waiting.push_back({std::move(event), bytes, metric, ofItsMetric});
  _bytes += bytes;
  if (_asked >= _waiting.size()) return false;
  ++_asked;
  return true;
}

void EventBacklog::makeRoom(std::size_t bytes) {
  while (!_waiting.empty() &&
         (_waiting.size() >= _limits.events || _bytes + bytes > _limits.bytes)) {
    const auto found = std::ranges::find_if(_waiting, [](const Waiting& waiting) {
      return !waiting.ofItsMetric || *waiting.ofItsMetric > 1;
    });
    remove(found == _waiting.end() ? _waiting.begin() : found);
    ++_dropped;
  }
}

EventBacklog::Event EventBacklog::remove(WaitingEvents::iterator waiting) {
  Event event = std::move(waiting->event);
  _bytes -= waiting->bytes;
  const bool isLast = waiting->ofItsMetric && --*waiting->ofItsMetric == 0;
  if (isLast && _metrics.size() > kMetricsRemembered) _metrics.erase(*waiting->metric);
  _waiting.erase(waiting);
  return event;
}

std::optional<EventBacklog::Event> EventBacklog::take() {
  const std::lock_guard lock(_mutex);
  if (_asked > 0) --_asked;
  if (_waiting.empty()) return std::nullopt;
  return remove(_waiting.begin());
}

bool EventBacklog::isEmpty() const {
  const std::lock_guard lock(_mutex);
  return _waiting.empty();
}

std::uint64_t EventBacklog::dropped() const {
  const std::lock_guard lock(_mutex);
  return _dropped;
}

}  // namespace tesk
