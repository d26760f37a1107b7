#include "export/MetricTable.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include "base/IsoTime.h"
#include "base/Rendering.h"
#include "base/Utf8.h"
#include "export/ShownUnits.h"
#include "messages/catalogue/FieldFacts.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel {
namespace {

bool makesFraction(const Rewrite& rewrite) {
  return rewrite.kind == Rewrite::Kind::scaleFloat || rewrite.kind == Rewrite::Kind::divideFloat ||
         rewrite.kind == Rewrite::Kind::bandwidth;
}

ColumnType typeOf(const FieldShape& field, const FieldFacts* facts, const Rewrite* rewrite) {
  if (field.kind == FieldKind::bytes) return ColumnType::bytes;
  const bool isNumber = field.kind == FieldKind::integer || field.kind == FieldKind::boolean;
  if (!isNumber || isTime(facts)) return ColumnType::text;
  return rewrite && makesFraction(*rewrite) ? ColumnType::real : ColumnType::integer;
}

Value cellOf(const Value& value, bool asTime) {
  if (asTime && value.asUInt64()) return isoTime(*value.asUInt64());
  if (const auto truth = value.asBoolean()) return *truth ? 1 : 0;
  if (const auto text = value.asText()) return withReplacements(*text);
  if (value.asList() || value.asDictionary()) return jsonText(value);
  return value;
}

}  // namespace

MetricTable::MetricTable(const MetricMessage& metric) {
  const DispatchRow* row = findDispatchRow(std::int64_t{metric.identifier} + kMetricEventBase);
  const Derivation derivation = row ? row->derivation : Derivation();
  // Lists of messages become rows and no texts; lists of numbers become the same text anyway.
  std::ranges::remove_copy_if(derivation.inPlace, std::back_inserter(_rewrites), makesText);
  _table.name = metric.className;
  _table.columns.push_back({"time_utc"});
  _fields = addFields(*metric.shape, {"", "", _rewrites});
  _firstOfEntries = _table.columns.size();
  addLists(*metric.shape, derivation.copies);
}

std::optional<std::size_t> MetricTable::find(const std::string& name, std::size_t from) const {
  for (std::size_t i = from; i < _table.columns.size(); ++i) {
    if (_table.columns[i].name == name) return i;
  }
  return std::nullopt;
}

std::size_t MetricTable::addColumn(Column column, const Scope& scope) {
  const bool isEntry = !scope.list.empty();
  const auto there = isEntry ? find(column.name, _firstOfEntries + 2) : std::nullopt;
  if (there) {
    const Column& other = _table.columns[*there];
    if (other.type == column.type && other.unit == column.unit) return *there;
  }
  if (find(column.name, 0)) column.name = scope.list + "_" + column.name;
  _table.columns.push_back(std::move(column));
  return _table.columns.size() - 1;
}

MetricTable::Places MetricTable::addFields(const MessageShape& shape, const Scope& scope) {
  const bool isReport = scope.list.empty() && scope.prefix.empty();
  const MessageFacts* all = findMessageFacts(shape.className);
  Places places;
  for (const FieldShape& field : shape.fields) {
    if (field.kind == FieldKind::messageList && isReport) continue;
    const std::string name = scope.prefix + std::string(field.key.view());
    if (field.kind == FieldKind::message) {
      places.push_back(
          {field.key, 0, false, addFields(*field.nested, {name + "_", scope.list, {}})});
      continue;
    }
    const Rewrite* rewrite = rewriteOf(scope.rewrites, field.key);
    const FieldFacts* facts = all ? all->find(field.key) : nullptr;
    const auto column = addColumn(
        {name, typeOf(field, facts, rewrite), unitOf(facts, rewrite), facts, !scope.list.empty()},
        scope);
    places.push_back({field.key, column, isTime(facts)});
  }
  return places;
}

void MetricTable::addLists(const MessageShape& shape, std::span<const ListCopy> copies) {
  for (const FieldShape& field : shape.fields) {
    if (field.kind != FieldKind::messageList) continue;
    if (_lists.empty()) {
      _table.columns.push_back({"list"});
      _table.columns.push_back({"entry", ColumnType::integer});
    }
    const auto copy = std::ranges::find(copies, field.key.view(),
                                        [](const ListCopy& each) { return each.key.view(); });
    const auto rewrites = copy == copies.end() ? std::span<const Rewrite>() : copy->rewrites;
    const std::string name(field.key.view());
    _lists.push_back({field.key, addFields(*field.nested, {"", name, rewrites}), rewrites});
  }
}

void MetricTable::fill(TableRow& row, const Dictionary& record, const Places& places) {
  for (const Place& place : places) {
    const Value* value = record.find(place.key);
    if (!value) continue;
    if (const Dictionary* nested = place.nested.empty() ? nullptr : value->asDictionary()) {
      fill(row, *nested, place.nested);
    } else {
      row[place.column] = cellOf(*value, place.isTime);
    }
  }
}

bool MetricTable::rows(std::uint64_t timeMs, Dictionary record, const PutRow& put) const {
  for (const Rewrite& rewrite : _rewrites) applyRewrite(rewrite, record, _bandwidths);
  return putRows(timeMs, record, Values::reported, put);
}

bool MetricTable::shownRows(std::uint64_t timeMs, const Dictionary& record,
                            const PutRow& put) const {
  return putRows(timeMs, record, Values::shown, put);
}

bool MetricTable::putRows(std::uint64_t timeMs, const Dictionary& record, Values ofEntries,
                          const PutRow& put) const {
  TableRow own(_table.columns.size());
  own[0] = isoTime(timeMs);
  fill(own, record, _fields);
  bool hasEntries = false;
  for (const ListPlace& list : _lists) {
    const Value* value = record.find(list.key);
    const List* entries = value ? value->asList() : nullptr;
    std::int64_t number = 0;
    for (std::size_t i = 0; entries && i < entries->size(); ++i) {
      const Dictionary* reported = (*entries)[i].asDictionary();
      if (!reported) continue;  // of a record that came from outside
      Dictionary entry = *reported;
      if (ofEntries == Values::reported) {
        for (const Rewrite& rewrite : list.rewrites) applyRewrite(rewrite, entry, _bandwidths);
      }
      TableRow row = own;
      row[_firstOfEntries] = list.key;
      row[_firstOfEntries + 1] = number++;
      fill(row, entry, list.fields);
      if (!put(row)) return false;
      hasEntries = true;
    }
  }
  return hasEntries || put(own);
}

}  // namespace qel
