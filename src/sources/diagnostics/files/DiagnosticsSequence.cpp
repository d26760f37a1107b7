#include "sources/diagnostics/files/DiagnosticsSequence.h"

#include "base/LogSink.h"
#include "sources/diagnostics/DiagnosticsFacts.h"

namespace qel::diagnostics {

using sources::SourceAnswer;
using sources::SourceCondition;
using sources::SourceEvent;

DiagnosticsSequence::DiagnosticsSequence(const std::string& path, unsigned radio) {
  sources::SourceError error;
  auto log = RawLog::open(path, error);
  // It was sound when the source was made; that it no longer is ends the events.
  if (log) {
    _events = std::make_unique<RawLogEvents>(std::move(log), radio);
  } else {
    systemLog().write(error.message);
  }
}

std::optional<SourceEvent> DiagnosticsSequence::next() {
  auto event = _events ? _events->next() : std::nullopt;
  if (!event && !_ended && _events && !_events->log().fault().message.empty()) {
    systemLog().write(_events->log().fault().message);
  }
  _ended = !event;
  return event;
}

void DiagnosticsSequence::passed(const SourceEvent& event) {
  if (const auto metric = metricOf(event)) _newest.insert_or_assign(*metric, event);
}

SourceAnswer DiagnosticsSequence::query(std::uint32_t metric) {
  const auto found = _newest.find(metric);
  if (found != _newest.end()) return {true, "", found->second.timeMs, found->second.entries};
  return {false, "metric " + std::to_string(metric) + " has not been told so far", 0, {}};
}

sources::SourceFacts DiagnosticsSequence::facts() const {
  if (!_events) return {};
  PortFacts facts;
  facts.port = _events->log().name();
  facts.build = _events->build();
  facts.frames = _events->log().frames();
  return factsOf(facts, _events->ofFirstRadio());
}

SourceCondition DiagnosticsSequence::condition() const {
  if (!_ended) return {"playing", "Raw log is playing", ""};
  const bool isWhole = _events && _events->log().fault().message.empty();
  return {"ended", "Raw log has ended", isWhole ? "" : "it cannot be read any more"};
}

}  // namespace qel::diagnostics
