#include "sources/diagnostics/DiagnosticsSource.h"

#include <utility>

#include "sources/diagnostics/DiagnosticsRun.h"

namespace qel::diagnostics {

DiagnosticsSource::DiagnosticsSource(DiagnosticsChoice choice, DiagnosticsWorld world,
                                     const DiagnosticsTiming& timing)
    : _choice(std::move(choice)), _world(std::move(world)), _timing(timing) {}

DiagnosticsSource::~DiagnosticsSource() { stop(); }

void DiagnosticsSource::start(std::weak_ptr<sources::EventReceiver> receiver,
                              std::shared_ptr<sources::ListenerSignal> listeners) {
  stop();
  auto run = std::make_shared<Run>(_choice, _world, _timing, std::move(receiver), listeners);
  listeners->wake(std::shared_ptr<const WakeUp>(run, &run->wakeUp()));
  const std::lock_guard lock(_mutex);
  _run = run;
  _threads.start([run] { run->play(); });
}

void DiagnosticsSource::stop() {
  const std::lock_guard lock(_mutex);
  if (_run) _run->stop();
  _run.reset();
}

sources::SourceAnswer DiagnosticsSource::query(std::uint32_t metric) {
  const auto now = run();
  if (!now) return {false, "the source is not running", 0, {}};
  return now->query(metric);
}

std::string DiagnosticsSource::description() const {
  return _choice.port.empty() ? "modem on its diagnostics port"
                              : "modem on the diagnostics port " + _choice.port;
}

sources::SourceFacts DiagnosticsSource::facts() const {
  const auto now = run();
  return now ? now->facts() : sources::SourceFacts();
}

std::string DiagnosticsSource::modem() const {
  const auto now = run();
  return now ? now->modem() : "";
}

std::shared_ptr<DiagnosticsSource::Run> DiagnosticsSource::run() const {
  const std::lock_guard lock(_mutex);
  return _run;
}

}  // namespace qel::diagnostics
