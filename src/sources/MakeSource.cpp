// Sources from what the user asked for.
#include <utility>

#include "base/Clock.h"
#include "sources/PacedSource.h"
#include "sources/SourceChoice.h"
#include "sources/modem_manager/ModemManagerSource.h"
#include "sources/recording/RecordingSequence.h"
#include "sources/simulated/SimulatedDrive.h"

namespace qel::sources {
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
                                              bus::BusAddress{choice.bus});
}

}  // namespace

std::unique_ptr<EventSource> makeSource(const SourceChoice& choice, SourceError& error,
                                        WaitClock& clock) {
  return std::visit([&](const auto& kind) { return make(kind, error, clock); }, choice);
}

}  // namespace qel::sources
