// Sources from what the user asked for.
#include <utility>

#include "base/Clock.h"
#include "sources/PacedSource.h"
#include "sources/SourceChoice.h"
#include "sources/combined/CombinedSource.h"
#include "sources/diagnostics/DiagnosticsSource.h"
#include "sources/diagnostics/files/DiagnosticsSequence.h"
#include "sources/diagnostics/port/PortName.h"
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
  return std::make_unique<ModemManagerSource>(ModemWish{choice.imei, choice.path, {}},
                                              bus::BusAddress{choice.bus});
}

// A port may be there later.
std::unique_ptr<EventSource> make(const DiagnosticsPlace& choice, SourceError& error,
                                  WaitClock& clock) {
  if (diagnostics::isPortName(choice.place)) {
    return std::make_unique<diagnostics::DiagnosticsSource>(
        diagnostics::DiagnosticsChoice{choice.place, choice.radio});
  }
  if (!diagnostics::checkRawLog(choice.place, error)) return nullptr;
  auto makeSequence = [choice]() -> std::unique_ptr<EventSequence> {
    return std::make_unique<diagnostics::DiagnosticsSequence>(choice.place, choice.radio);
  };
  return std::make_unique<PacedSource>("raw log " + choice.place, std::move(makeSequence),
                                       choice.speed.value_or(1), clock);
}

// Of several modems ModemManager's is the one whose port it is.
std::unique_ptr<EventSource> make(const CombinedChoice& choice, SourceError&, WaitClock&) {
  auto port = std::make_shared<diagnostics::DiagnosticsSource>(
      diagnostics::DiagnosticsChoice{choice.port.place, choice.port.radio, choice.isPortMissed});
  auto deviceOfPort = [held = std::weak_ptr(port)] {
    const auto source = held.lock();
    return source ? source->modem() : std::string();
  };
  auto manager = std::make_unique<ModemManagerSource>(
      ModemWish{choice.manager.imei, choice.manager.path, std::move(deviceOfPort)},
      bus::BusAddress{choice.manager.bus});
  return std::make_unique<CombinedSource>(
      std::move(port), std::move(manager),
      choice.isPortMissed ? CombinedSource::Port::missed : CombinedSource::Port::welcome);
}

}  // namespace

std::unique_ptr<EventSource> makeSource(const SourceChoice& choice, SourceError& error,
                                        WaitClock& clock) {
  return std::visit([&](const auto& kind) { return make(kind, error, clock); }, choice);
}

}  // namespace qel::sources
