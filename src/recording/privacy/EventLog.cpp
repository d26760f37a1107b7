#include "recording/privacy/EventLog.h"

#include <algorithm>
#include <array>
#include <utility>

namespace qel {
namespace {

struct EventsName {
  std::string_view name;
  LoggedEvents events;
};

constexpr std::array kNames = {
    EventsName{"full", LoggedEvents::full},
    EventsName{"hidden", LoggedEvents::hidden},
    EventsName{"none", LoggedEvents::none},
};

}  // namespace

std::vector<std::string> loggedEventsNames() {
  std::vector<std::string> names;
  for (const EventsName& row : kNames) names.emplace_back(row.name);
  return names;
}

std::optional<LoggedEvents> loggedEventsNamed(std::string_view name) {
  const auto row = std::ranges::find(kNames, name, &EventsName::name);
  return row == kNames.end() ? std::nullopt : std::optional(row->events);
}

EventLog::EventLog(std::shared_ptr<LogSink> log, LoggedEvents events)
    : _log(std::move(log)), _events(events) {
  if (events == LoggedEvents::hidden) _hider.emplace(Pseudonyms::random());
}

void EventLog::write(std::string_view line) { _log->write(line); }

void EventLog::writeEvent(std::string_view text, const Dictionary& event) {
  if (_events == LoggedEvents::none || !_log->wantsLines()) return;
  if (_events == LoggedEvents::full) return _log->writeEvent(text, event);
  _log->writeEvent(text, withoutIdentities(event));
}

void EventLog::flush() { _log->flush(); }

Dictionary EventLog::withoutIdentities(const Dictionary& event) {
  const bool isMetric = event.contains(kRecordedMetricKey);
  RecordedEvent hidden{0, isMetric ? RecordedKind::metric : RecordedKind::trigger, event};
  const std::lock_guard lock(_mutex);
  if (_hider->hide(hidden)) return std::move(hidden.entries);
  hidden.entries = event;  // its payload cannot be decoded, so nobody knows what it tells
  hidden.entries.remove(kRecordedPayloadKey);
  _hider->hide(hidden);
  return std::move(hidden.entries);
}

}  // namespace qel
