#include "capture/Recorder.h"

#include <chrono>
#include <utility>

#include "recording/EventLine.h"
#include "recording/Mark.h"
#include "recording/Sleep.h"
#include "tesk/Constants.h"

namespace qel::capture {
namespace {

using std::chrono::steady_clock;

constexpr std::chrono::seconds kShortestSleep{5};

}  // namespace

std::optional<RecordedEvent> recordedEvent(std::string_view eventName, const tesk::Message& event,
                                           std::uint64_t timeMs) {
  if (eventName == tesk::kEventMetric) {
    return RecordedEvent{timeMs, RecordedKind::metric, event.entries()};
  }
  if (eventName != tesk::kEventTrigger) return std::nullopt;
  return RecordedEvent{timeMs, RecordedKind::trigger, event.entries()};
}

Recorder::Recorder(std::unique_ptr<RotatingRecording> recording,
                   std::unique_ptr<IdentityHider> hider, const Clock& clock, Asleep asleep)
    : _recording(std::move(recording)),
      _hider(std::move(hider)),
      _clock(clock),
      _asleep(std::move(asleep)),
      _slept(_asleep()) {}

void Recorder::noteSleep() {
  const auto slept = _asleep();
  const auto length = slept - std::exchange(_slept, slept);
  if (length < kShortestSleep) return;
  _recording->write(sleepEvent(_clock.nowMs(), length), now());
}

RotatingRecording::TimePoint Recorder::now() const { return steady_clock::now() + _slept; }

bool Recorder::isRecordable(RecordedEvent& event) {
  if (!hasReadableForm(event)) {
    ++_shapeless;
    return false;
  }
  return !_hider || _hider->hide(event);
}

void Recorder::take(std::string_view eventName, const tesk::Message& event) {
  const std::lock_guard lock(_mutex);
  noteSleep();
  auto recorded = recordedEvent(eventName, event, _clock.nowMs());
  if (recorded && isRecordable(*recorded)) _recording->write(*recorded, now());
}

bool Recorder::mark() {
  const std::lock_guard lock(_mutex);
  noteSleep();
  if (!_recording->write(markEvent(_clock.nowMs(), _marks + 1), now())) return false;
  ++_marks;
  return true;
}

bool Recorder::tend() {
  const std::lock_guard lock(_mutex);
  noteSleep();
  return _recording->tend(now());
}

bool Recorder::close() {
  const std::lock_guard lock(_mutex);
  return _recording->close();
}

Recorder::Progress Recorder::progress() const {
  const std::lock_guard lock(_mutex);
  const std::uint64_t formless = _shapeless + _recording->eventsLeftOut();
  return {_recording->events(),
          _recording->bytes(),
          _recording->filesFinished(),
          _marks,
          formless + (_hider ? _hider->undecodable() : 0),
          _hider ? _hider->stripped() : 0};
}

std::string Recorder::error() const {
  const std::lock_guard lock(_mutex);
  return _recording->error();
}

int Recorder::errorNumber() const {
  const std::lock_guard lock(_mutex);
  return _recording->errorNumber();
}

}  // namespace qel::capture
