#include "export/Exporter.h"

#include <utility>

#include "export/HappeningTable.h"
#include "history/ToldHappening.h"
#include "messages/catalogue/TagLog.h"
#include "recording/RecordedMetric.h"

namespace qel {

Exporter::Exporter(TableSink& sink, IdentityHider* hider)
    : _sink(sink), _hider(hider), _dispatcher(&_history) {}

bool Exporter::report(const RecordedEvent& event) {
  const MetricMessage* message = messageOf(event.entries);
  if (!message) {
    ++_counts.without;
    return true;
  }
  const CountedTagLines tagLines;
  auto record = message->describe(payloadOf(event.entries));
  if (!record) return true;
  const MetricTable& table = _tables.try_emplace(message->identifier, *message).first->second;
  ++_counts.events;
  return table.rows(event.timeMs, std::move(*record), [&](const TableRow& row) {
    ++_counts.rows;
    return _sink.put(table.table(), row);
  });
}

bool Exporter::tellHappenings() {
  const auto& happenings = _history.happenings();
  const std::uint64_t gone = _history.happeningsGone();
  for (; _happeningsTold < gone + happenings.size(); ++_happeningsTold) {
    const auto index = static_cast<std::size_t>(_happeningsTold - gone);
    if (!_sink.put(happeningTable(), rowOf(happenings[index]))) return false;
  }
  return true;
}

bool Exporter::take(RecordedEvent event) {
  if (_hider && !_hider->hide(event)) return true;
  if (event.kind == RecordedKind::metric) {
    if (!report(event)) return false;
    _dispatcher.take(event.entries, event.timeMs);
  } else if (auto told = happeningToldBy(event)) {
    _history.add(std::move(*told));
  }
  return tellHappenings();
}

bool Exporter::finish() {
  _counts.tables = _tables.size();
  _counts.happenings = _happeningsTold;
  return _sink.make(happeningTable()) && _sink.finish();
}

}  // namespace qel
