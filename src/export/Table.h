// What an export writes: tables of typed columns.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Value.h"

namespace qel {

struct FieldFacts;

enum class ColumnType : std::uint8_t { integer, real, text, bytes };

struct Column {
  std::string name;  // unique in its table
  ColumnType type = ColumnType::text;
  std::string unit = {};              // empty: none
  const FieldFacts* facts = nullptr;  // of the field that it holds; null: of none
  bool isOfEntry = false;             // of a list
};

struct Table {
  std::string name;
  std::vector<Column> columns;
};

// A cell a column; null: nothing was reported. A boolean is 1 or 0, a text is UTF-8.
using TableRow = std::vector<Value>;

// Where tables go. One thread. What is written stands beside its place until finish(), and goes
// with this when that never comes.
class TableSink {
 public:
  virtual ~TableSink() = default;

  // A table that is there without a row too. A table must stay where it is.
  virtual bool make(const Table& table) = 0;
  // Adds a row to the table, which is made for its first one. False when it could not be written;
  // nothing is written any more then.
  virtual bool put(const Table& table, const TableRow& row) = 0;
  // Puts all into its place. False when that failed.
  virtual bool finish() = 0;

  // After a false: one line, "FILE: WHY".
  virtual const std::string& error() const = 0;
};

}  // namespace qel
