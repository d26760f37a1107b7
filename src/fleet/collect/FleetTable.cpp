#include "fleet/collect/FleetTable.h"

#include <algorithm>
#include <array>

#include "export/ShownUnits.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel::fleet {
namespace {

constexpr std::string_view kCommonStart = "KCellular";

bool isUpper(char c) { return c >= 'A' && c <= 'Z'; }
char lower(char c) { return isUpper(c) ? static_cast<char>(c - 'A' + 'a') : c; }

std::string tableName(std::string_view className) {
  if (className.starts_with(kCommonStart)) className.remove_prefix(kCommonStart.size());
  std::string name;
  for (const char c : className) {
    if (isUpper(c) && !name.empty()) name += '_';
    name += lower(c);
  }
  return name;
}

std::string lowered(std::string name) {
  std::ranges::transform(name, name.begin(), lower);
  return name;
}

std::string_view sqlTypeOf(ColumnType type, bool isTime) {
  constexpr std::array<std::string_view, 4> kTypes = {"bigint", "double precision", "text",
                                                      "bytea"};
  return isTime ? "timestamp with time zone" : kTypes[static_cast<std::size_t>(type)];
}

std::vector<FleetTable> makeTables() {
  std::vector<FleetTable> tables;
  tables.reserve(metricMessages().size());
  for (const MetricMessage& metric : metricMessages()) tables.emplace_back(metric);
  return tables;
}

}  // namespace

FleetTable::FleetTable(const MetricMessage& metric)
    : _metric(metric), _name(tableName(metric.className)), _rows(metric) {
  const auto& columns = _rows.table().columns;
  for (std::size_t i = 1; i < columns.size(); ++i) {
    const Column& column = columns[i];
    const bool isTimeColumn = isTime(column.facts);
    _columns.push_back({lowered(column.name), column.type, isTimeColumn,
                        sqlTypeOf(column.type, isTimeColumn), column.unit});
  }
}

std::span<const FleetTable> fleetTables() {
  static const std::vector<FleetTable> kTables = makeTables();
  return kTables;
}

const FleetTable* findFleetTable(std::uint32_t metric) {
  const auto tables = fleetTables();
  const auto found = std::ranges::find(
      tables, metric, [](const FleetTable& table) { return table.metric().identifier; });
  return found == tables.end() ? nullptr : &*found;
}

const FleetTable* findFleetTable(std::string_view metricName) {
  const auto catalogue = KBBMetricUtility::catalogue();
  const auto known = std::ranges::find(catalogue, metricName, &MetricName::name);
  return known == catalogue.end() ? nullptr : findFleetTable(known->identifier);
}

}  // namespace qel::fleet
