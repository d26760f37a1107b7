// Sources from what the user asked for.
#include <utility>

#include "base/Clock.h"
#include "service/sources/PacedSource.h"
#include "service/sources/RecordingSequence.h"
#include "service/sources/SourceSpec.h"
#include "service/sources/simulated/SimulatedDrive.h"

namespace qel::service {
namespace {

std::unique_ptr<EventSource> make(const SimulatedSpec& spec, SourceError&, WaitClock& clock) {
  auto makeDrive = [spec]() -> std::unique_ptr<EventSequence> {
    return std::make_unique<SimulatedDrive>(spec.seed,
                                            spec.startMs.value_or(systemClock().nowMs()));
  };
  return std::make_unique<PacedSource>("simulated drive, seed " + std::to_string(spec.seed),
                                       std::move(makeDrive), spec.speed, clock);
}

std::unique_ptr<EventSource> make(const RecordingSpec& spec, SourceError& error, WaitClock& clock) {
  auto firsts = std::make_shared<EventOfMetric>();
  if (!checkRecording(spec.path, *firsts, error)) return nullptr;
  auto makeSequence = [spec, firsts]() -> std::unique_ptr<EventSequence> {
    return std::make_unique<RecordingSequence>(spec.path, spec.loops, firsts);
  };
  return std::make_unique<PacedSource>("recording " + spec.path, std::move(makeSequence),
                                       spec.speed, clock);
}

}  // namespace

std::unique_ptr<EventSource> makeSource(const SourceSpec& spec, SourceError& error,
                                        WaitClock& clock) {
  return std::visit([&](const auto& kind) { return make(kind, error, clock); }, spec);
}

}  // namespace qel::service
