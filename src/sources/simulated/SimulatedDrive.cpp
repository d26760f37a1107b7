#include "sources/simulated/SimulatedDrive.h"

#include <algorithm>
#include <utility>

#include "sources/Metrics.h"
#include "sources/simulated/Journey.h"
#include "sources/simulated/ReportTable.h"

namespace qel::sources {
namespace {

// Enough for a report's period; more are forgotten while there is nobody to report to.
constexpr std::size_t kMostSamples = 5;

RadioScene sceneAtStart(std::uint64_t seed) {
  RadioScene scene(seed);
  scene.update(carPositionM(0), 0);
  return scene;
}

}  // namespace

SimulatedDrive::SimulatedDrive(std::uint64_t seed, std::uint64_t startMs)
    : _startMs(startMs), _scene(sceneAtStart(seed)), _phone(seed, _scene, startMs) {
  collectSample();
}

std::optional<SourceEvent> SimulatedDrive::next() {
  while (_ready.empty()) advance();
  SourceEvent event = std::move(_ready.front());
  _ready.pop_front();
  return event;
}

SourceAnswer SimulatedDrive::query(std::uint32_t metric) {
  const ReportRow* row = findReport(metric);
  const std::uint64_t timeMs = _startMs + (_step == 0 ? 0 : _step - 1) * kStepMs;
  auto payload = row ? row->build(view(), timeMs) : std::nullopt;
  if (!payload) {
    return {false, "metric " + std::to_string(metric) + " has no value at the moment", timeMs, {}};
  }
  return {true, "", timeMs, metricEvent(metric, std::move(*payload), timeMs).entries};
}

void SimulatedDrive::advance() {
  const std::uint64_t elapsedMs = _step * kStepMs;
  const std::uint64_t stepMs = _startMs + elapsedMs;
  Changes changes;
  // The first step finds the phone as it was switched on.
  if (_step > 0) {
    _scene.update(carPositionM(elapsedMs), _step);
    _phone.step(_scene, stepMs, changes);
    collectSample();
  }
  emitChanges(changes, stepMs);
  emitPeriodic(changes, stepMs);
  ++_step;
}

void SimulatedDrive::collectSample() {
  if (_phone.technology() != Technology::lte) {
    _samples.clear();
    return;
  }
  if (_samples.size() == kMostSamples) _samples.erase(_samples.begin());
  _samples.push_back({_phone.serving().code, _scene.of(_phone.servingIndex())});
}

void SimulatedDrive::emit(std::uint32_t metric, std::uint64_t timeMs) {
  auto payload = findReport(metric)->build(view(), timeMs);
  if (!payload) return;
  add(metricEvent(metric, std::move(*payload), timeMs));
}

void SimulatedDrive::emit(Trigger trigger, std::uint64_t timeMs) {
  add({timeMs,
       tesk::kEventTrigger,
       {{tesk::kKeyTriggerID, std::int64_t{static_cast<std::uint32_t>(trigger)}}}});
}

// Behind those of the same time.
void SimulatedDrive::add(SourceEvent event) {
  const auto behind = std::ranges::upper_bound(_ready, event.timeMs, {}, &SourceEvent::timeMs);
  _ready.insert(behind, std::move(event));
}

// A trigger comes before what it triggers; both come before the step's other reports.
void SimulatedDrive::emitChanges(const Changes& changes, std::uint64_t stepMs) {
  for (const Trigger trigger : changes.triggers) emit(trigger, stepMs);
  for (const std::uint32_t metric : changes.metrics) emit(metric, stepMs + 1);
}

void SimulatedDrive::emitPeriodic(const Changes& changes, std::uint64_t stepMs) {
  for (const ReportRow& row : reportTable()) {
    const bool due =
        _step == 0 ? row.atStart : row.periodMs != 0 && _step * kStepMs % row.periodMs == 0;
    const bool reported = std::ranges::find(changes.metrics, row.metric) != changes.metrics.end();
    if (!due || reported) continue;
    emit(row.metric, stepMs + row.phaseMs);
    if (row.metric == metric::kLteRsrpRsrqSinr) _samples.clear();
  }
}

}  // namespace qel::sources
