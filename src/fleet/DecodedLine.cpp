#include "fleet/DecodedLine.h"

#include <algorithm>
#include <span>
#include <utility>

#include "base/Rendering.h"
#include "export/ShownUnits.h"
#include "fleet/MetricNames.h"
#include "messages/catalogue/FieldFacts.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "metrics/DispatchTable.h"
#include "recording/RecordedMetric.h"

namespace qel::fleet {
namespace {

const BandwidthTable& bandwidths() {
  static const BandwidthTable kBandwidths = makeBandwidthTable();
  return kBandwidths;
}

Derivation derivationOf(const MetricMessage& metric) {
  const DispatchRow* row = findDispatchRow(std::int64_t{metric.identifier} + kMetricEventBase);
  return row ? row->derivation : Derivation();
}

std::span<const Rewrite> rewritesOf(const Derivation& derivation, Name list) {
  const auto copy = std::ranges::find(derivation.copies, list.view(),
                                      [](const ListCopy& each) { return each.key.view(); });
  return copy == derivation.copies.end() ? std::span<const Rewrite>() : copy->rewrites;
}

void showEntries(const ListCopy& copy, Dictionary& record) {
  Value* value = record.find(copy.key.view());
  const List* list = value ? value->asList() : nullptr;
  if (!list) return;
  List shown;
  for (const Value& each : *list) {
    const Dictionary* reported = each.asDictionary();
    if (!reported) return;
    Dictionary entry = *reported;
    for (const Rewrite& rewrite : copy.rewrites) applyRewrite(rewrite, entry, bandwidths());
    shown.emplace_back(std::move(entry));
  }
  *value = std::move(shown);
}

// Texts made of lists are for tables: here a list stays one.
void show(const Derivation& derivation, Dictionary& record) {
  for (const Rewrite& rewrite : derivation.inPlace) {
    if (!makesText(rewrite)) applyRewrite(rewrite, record, bandwidths());
  }
  for (const ListCopy& copy : derivation.copies) showEntries(copy, record);
}

Dictionary unitsOf(const MessageShape& shape, std::span<const Rewrite> rewrites,
                   const Derivation& derivation) {
  const MessageFacts* all = findMessageFacts(shape.className);
  Dictionary units;
  for (const FieldShape& field : shape.fields) {
    if (field.nested) {
      Dictionary nested = unitsOf(*field.nested, rewritesOf(derivation, field.key), {});
      if (!nested.empty()) units.append(field.key, std::move(nested));
      continue;
    }
    const FieldFacts* facts = all ? all->find(field.key.view()) : nullptr;
    std::string unit = isTime(facts) ? "ms" : unitOf(facts, rewriteOf(rewrites, field.key.view()));
    if (!unit.empty()) units.append(field.key, std::move(unit));
  }
  return units;
}

std::string_view nameOf(RecordedKind kind) {
  for (const RecordedKindName& row : kRecordedKindNames) {
    if (row.kind == kind) return row.name;
  }
  return {};
}

}  // namespace

std::optional<std::string> decodedLine(const RecordedEvent& event) {
  Dictionary line{{kRecordedTimeKey, event.timeMs}, {kRecordedEventKey, nameOf(event.kind)}};
  const MetricMessage* metric =
      event.kind == RecordedKind::metric ? messageOf(event.entries) : nullptr;
  if (!metric) {
    line.append("entries", event.entries);
    return jsonText(line);
  }
  auto record = metric->describe(payloadOf(event.entries));
  if (!record) return std::nullopt;
  const Derivation derivation = derivationOf(*metric);
  show(derivation, *record);
  line.append("metric", metricNameOf(event));
  line.append("record", std::move(*record));
  line.append("units", unitsOf(*metric->shape, derivation.inPlace, derivation));
  return jsonText(line);
}

}  // namespace qel::fleet
