#include "fleet/EventIntake.h"

#include <optional>
#include <string>
#include <utility>

#include "capture/Recorder.h"
#include "fleet/DecodedLine.h"
#include "fleet/MetricNames.h"
#include "recording/EventLine.h"
#include "recording/LineLimits.h"

namespace qel::fleet {
EventIntake::EventIntake(EventQueue& queue, EventForm form, std::unique_ptr<IdentityHider> hider,
                         std::function<void(std::size_t)> added, const Clock& clock)
    : _queue(queue),
      _form(form),
      _hider(std::move(hider)),
      _added(std::move(added)),
      _clock(clock) {}

void EventIntake::take(std::string_view eventName, const tesk::Message& event) {
  auto recorded = capture::recordedEvent(eventName, event, _clock.nowMs());
  if (!recorded) return;
  const std::lock_guard lock(_mutex);
  if (!hasReadableForm(*recorded)) {
    ++_shapeless;
    return;
  }
  if (_hider && !_hider->hide(*recorded)) return;
  const auto line =
      _form == EventForm::decoded ? decodedLine(*recorded) : std::optional(eventLine(*recorded));
  if (!line || line->size() > kLongestLineBytes) {
    ++_shapeless;
    return;
  }
  const bool isAdded = _queue.add(recorded->timeMs, metricNameOf(*recorded), *line);
  _added(isAdded ? line->size() : 0);
}

EventIntake::Counts EventIntake::counts() const {
  const std::lock_guard lock(_mutex);
  if (!_hider) return {_shapeless, 0};
  return {_shapeless + _hider->undecodable(), _hider->stripped()};
}

}  // namespace qel::fleet
