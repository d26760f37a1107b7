// Tables of a fleet's events: one a message class.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "export/MetricTable.h"

namespace qel::fleet {

inline constexpr std::string_view kSchema = "qelwatch";

struct FleetColumn {
  std::string name;  // lower case
  ColumnType type = ColumnType::text;
  bool isTime = false;
  std::string_view sqlType;
  std::string unit;  // empty: none
};

// Behind phone, stream, number and time, which every table has, come the columns of an export.
// Constant once made.
class FleetTable {
 public:
  explicit FleetTable(const MetricMessage& metric);

  // Without the schema: "lte_rrc_state" of KCellularLteRrcState.
  const std::string& name() const { return _name; }
  const MetricMessage& metric() const { return _metric; }
  // Of the row's cells from the second one on, the first being the time.
  std::span<const FleetColumn> columns() const { return _columns; }
  const MetricTable& rows() const { return _rows; }

 private:
  const MetricMessage& _metric;
  const std::string _name;
  const MetricTable _rows;
  std::vector<FleetColumn> _columns;
};

// Of all message classes, in their order.
std::span<const FleetTable> fleetTables();
// That of a metric, or null.
const FleetTable* findFleetTable(std::uint32_t metric);
// By the metric's name in the catalogue, or null.
const FleetTable* findFleetTable(std::string_view metricName);

}  // namespace qel::fleet
