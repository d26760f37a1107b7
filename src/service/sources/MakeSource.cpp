// Sources from what the user asked for.
#include <utility>

#include "base/Clock.h"
#include "service/sources/PacedSource.h"
#include "service/sources/RecordingSequence.h"
#include "service/sources/SourceChoice.h"
#include "service/sources/modem_manager/ModemManagerSource.h"
#include "service/sources/simulated/SimulatedDrive.h"

namespace qel::service {
namespace {

std::unique_ptr<EventSource> make(const SimulatedChoice& choice, SourceError&, WaitClock& clock) {
  auto makeDrive = [choice]() -> std::unique_ptr<EventSequence> {
    return std::make_unique<SimulatedDrive>(choice.seed,
                                            choice.startMs.value_or(systemClock().nowMs()));
  };
  return std::make_unique<PacedSource>("simulated drive, seed " + std::to_string(choice.seed),
                                       std::move(makeDrive), choice.speed, clock);
}

std::unique_ptr<EventSource> make(const RecordingChoice& choice, SourceError& error,
                                  WaitClock& clock) {
  auto firsts = std::make_shared<EventOfMetric>();
  if (!checkRecording(choice.path, *firsts, error)) return nullptr;
  auto makeSequence = [choice, firsts]() -> std::unique_ptr<EventSequence> {
    return std::make_unique<RecordingSequence>(choice.path, choice.loops, firsts);
  };
  return std::make_unique<PacedSource>("recording " + choice.path, std::move(makeSequence),
                                       choice.speed, clock);
}

// There may be no bus yet, and no modem: the source waits for them.
std::unique_ptr<EventSource> make(const ModemManagerChoice& choice, SourceError&, WaitClock&) {
  return std::make_unique<ModemManagerSource>(ModemWish{choice.imei, choice.path},
                                              tesk::bus::BusAddress{choice.bus});
}

}  // namespace

std::unique_ptr<EventSource> makeSource(const SourceChoice& choice, SourceError& error,
                                        WaitClock& clock) {
  return std::visit([&](const auto& kind) { return make(kind, error, clock); }, choice);
}

}  // namespace qel::service
