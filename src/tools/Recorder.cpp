#include "tools/Recorder.h"

#include <chrono>
#include <utility>

#include "tesk/Constants.h"

namespace qel::tools {
namespace {

using std::chrono::steady_clock;

// Whether a reader of recordings would take it for an event.
bool hasForm(const RecordedEvent& event) {
  const Value* payload = event.entries.find(kRecordedPayloadKey);
  if (payload && !payload->asBytes()) return false;
  if (event.kind != RecordedKind::metric) return true;
  const Value* metric = event.entries.find(kRecordedMetricKey);
  return metric && metric->kind() != Value::Kind::floating && metric->asInt64();
}

}  // namespace

Recorder::Recorder(std::unique_ptr<RotatingRecording> recording,
                   std::unique_ptr<IdentityHider> hider, const Clock& clock)
    : _recording(std::move(recording)), _hider(std::move(hider)), _clock(clock) {}

bool Recorder::isRecordable(RecordedEvent& event) {
  if (!hasForm(event)) {
    ++_shapeless;
    return false;
  }
  return !_hider || _hider->hide(event);
}

void Recorder::take(std::string_view eventName, const tesk::Message& event) {
  if (eventName != tesk::kEventMetric && eventName != tesk::kEventTrigger) return;
  const auto kind = eventName == tesk::kEventMetric ? RecordedKind::metric : RecordedKind::trigger;
  const std::lock_guard lock(_mutex);
  RecordedEvent recorded{_clock.nowMs(), kind, event.entries()};
  if (isRecordable(recorded)) _recording->write(recorded, steady_clock::now());
}

bool Recorder::tend() {
  const std::lock_guard lock(_mutex);
  return _recording->tend(steady_clock::now());
}

bool Recorder::close() {
  const std::lock_guard lock(_mutex);
  return _recording->close();
}

Recorder::Progress Recorder::progress() const {
  const std::lock_guard lock(_mutex);
  return {_recording->events(), _recording->bytes(), _recording->filesFinished(),
          _shapeless + (_hider ? _hider->undecodable() : 0), _hider ? _hider->stripped() : 0};
}

std::string Recorder::error() const {
  const std::lock_guard lock(_mutex);
  return _recording->error();
}

int Recorder::errorNumber() const {
  const std::lock_guard lock(_mutex);
  return _recording->errorNumber();
}

}  // namespace qel::tools
