#include "export/HappeningTable.h"

#include <array>
#include <optional>
#include <string_view>

#include "base/IsoTime.h"

namespace qel {
namespace {

struct CellColumn {
  std::string_view name;
  ColumnType type;
  Value (*value)(const Cell& cell);
};

Value orNull(const std::optional<std::uint32_t>& number) {
  return number ? Value(*number) : Value();
}
Value orNull(const std::string& text) { return text.empty() ? Value() : Value(text); }

constexpr std::array kCellColumns = {
    CellColumn{"technology", ColumnType::text,
               [](const Cell& cell) { return Value(nameOf(cell.technology)); }},
    CellColumn{"channel", ColumnType::integer,
               [](const Cell& cell) { return orNull(cell.channel); }},
    CellColumn{"code", ColumnType::integer, [](const Cell& cell) { return orNull(cell.code); }},
    CellColumn{"cell_id", ColumnType::integer,
               [](const Cell& cell) { return orNull(cell.cellId); }},
    CellColumn{"area", ColumnType::integer, [](const Cell& cell) { return orNull(cell.area); }},
    CellColumn{"mcc", ColumnType::text, [](const Cell& cell) { return orNull(cell.mcc); }},
    CellColumn{"mnc", ColumnType::text, [](const Cell& cell) { return orNull(cell.mnc); }},
};

Table makeTable() {
  Table table{"happenings",
              {{"time_utc"}, {"kind"}, {"technology"}, {"metric", ColumnType::integer}, {"text"}}};
  for (const std::string side : {"from_", "to_"}) {
    for (const CellColumn& column : kCellColumns) {
      table.columns.push_back({side + std::string(column.name), column.type});
    }
  }
  return table;
}

}  // namespace

const Table& happeningTable() {
  static const Table table = makeTable();
  return table;
}

TableRow rowOf(const Happening& happening) {
  TableRow row;
  row.emplace_back(isoTime(happening.timeMs));
  row.emplace_back(nameOf(happening.kind));
  row.push_back(happening.technology ? Value(nameOf(*happening.technology)) : Value());
  row.push_back(happening.metric == 0 ? Value() : Value(happening.metric));
  row.emplace_back(happening.text);
  for (const auto* cell : {&happening.from, &happening.to}) {
    for (const CellColumn& column : kCellColumns) {
      row.push_back(*cell ? column.value(**cell) : Value());
    }
  }
  return row;
}

}  // namespace qel
