// Rows of an export's table as a database takes them.
#pragma once

#include <string>
#include <vector>

#include "fleet/collect/PhoneMessage.h"

namespace qel::fleet {

// Valid UTF-8 without the one character that the database has no place for.
std::string databaseText(std::string_view text);

// Takes rows of the table. Every cell is checked against the type of its column: records may come
// from outside.
class CopyRows {
 public:
  explicit CopyRows(const FleetTable& table) : _columns(table.columns()) {}

  // False beyond a limit, or for a cell that is not of its column's type: see fault().
  bool add(const TableRow& row);
  std::vector<CopyRow> take() { return std::move(_rows); }
  const std::string& fault() const { return _fault; }

 private:
  bool addCell(const FleetColumn& column, const Value& value, CopyRow& row);

  const std::span<const FleetColumn> _columns;
  std::vector<CopyRow> _rows;
  std::size_t _bytes = 0;
  std::string _fault;
};

}  // namespace qel::fleet
