#include "fleet/FieldNumbers.h"

#include <algorithm>
#include <optional>
#include <utility>

#include "history/NeighbourReports.h"
#include "history/ServingValues.h"
#include "messages/catalogue/FieldFacts.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel::fleet {
namespace {

constexpr std::string_view kCommonBegin = "KCellular";

bool isOfCells(std::uint32_t metric) {
  const std::int64_t identifier = std::int64_t{metric} + kMetricEventBase;
  if (ServingReader::placeOf(identifier)) return true;
  for (const Technology technology : {Technology::lte, Technology::umts, Technology::gsm}) {
    for (const std::int64_t each : neighbourMetrics(technology)) {
      if (each == identifier) return true;
    }
  }
  return false;
}

// Whether it says which entry of its list this is.
bool tellsApart(const Column& column) {
  return column.isOfEntry && column.facts && column.facts->identifies &&
         column.type == ColumnType::integer;
}

bool isNumber(const Column& column) {
  const bool hasNumbers = column.type == ColumnType::integer || column.type == ColumnType::real;
  return hasNumbers && column.facts && !column.unit.empty();
}

// What the schemas say of a number that is told in another unit than it comes in is of the latter.
std::string helpOf(const FieldFacts& facts) {
  std::string help(facts.label);
  if (!facts.meaning.empty() && facts.raw.empty()) (help += ". ") += facts.meaning;
  return help;
}

std::string familyWords(std::string_view className, std::string_view field) {
  if (className.starts_with(kCommonBegin)) className.remove_prefix(kCommonBegin.size());
  return asWords(className).append("_").append(field);
}

std::optional<double> numberIn(const Value& value) {
  if (const auto whole = value.asInt64()) return static_cast<double>(*whole);
  if (const auto fraction = value.asFloat()) return widened(*fraction);
  return std::nullopt;
}

}  // namespace

bool FieldNumbers::Report::has(std::string_view name) const {
  return std::ranges::any_of(numbers, [&](const Number& each) { return each.name.text == name; });
}

FieldNumbers::FieldNumbers() {
  for (const MetricMessage& message : metricMessages()) {
    Report report(message);
    const auto& columns = report.table.table().columns;
    const bool hasLevels = isOfCells(message.identifier);
    for (std::size_t i = 0; i < columns.size(); ++i) {
      const Column& column = columns[i];
      if (tellsApart(column)) report.labels.push_back({i, asWords(column.name)});
      if (!isNumber(column) || (hasLevels && column.facts->quality)) continue;
      auto name = numberName(familyWords(message.className, column.name), column.unit);
      if (name && report.has(name->text)) {
        name = numberName(familyWords(message.className, "entry_" + column.name), column.unit);
      }
      if (name) report.numbers.push_back({i, std::move(*name), helpOf(*column.facts)});
    }
    if (!report.numbers.empty()) _reports.emplace(message.identifier, std::move(report));
  }
}

void FieldNumbers::tell(std::uint32_t metric, ByteView payload, std::uint64_t timeMs,
                        NumberBoard& board) const {
  const auto found = _reports.find(metric);
  if (found == _reports.end()) return;
  const Report& report = found->second;
  auto record = report.message.describe(payload);
  if (!record) return;
  const auto& columns = report.table.table().columns;
  std::vector<NumberBoard::Numbers> all(report.numbers.size());
  report.table.rows(timeMs, std::move(*record), [&](const TableRow& row) {
    NumberBoard::Labels labels;
    for (const Label& label : report.labels) {
      if (const auto number = row[label.column].asInt64()) {
        labels.emplace_back(label.name, std::to_string(*number));
      }
    }
    for (std::size_t i = 0; i < all.size(); ++i) {
      const Number& number = report.numbers[i];
      const bool isOfEntry = columns[number.column].isOfEntry;
      const auto value = numberIn(row[number.column]);
      if (!value || (isOfEntry && labels.empty())) continue;
      all[i].insert_or_assign(isOfEntry ? labels : NumberBoard::Labels(),
                              number.name.inBaseUnit(*value));
    }
    return true;
  });
  for (std::size_t i = 0; i < all.size(); ++i) {
    board.set(report.numbers[i].name.text, report.numbers[i].help, std::move(all[i]), timeMs);
  }
}

std::vector<std::string> FieldNumbers::names() const {
  std::vector<std::string> names;
  for (const auto& [metric, report] : _reports) {
    for (const Number& number : report.numbers) names.push_back(number.name.text);
  }
  return names;
}

}  // namespace qel::fleet
