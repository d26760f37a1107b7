#include "tools/Exported.h"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <string_view>
#include <utility>

#include "base/Rendering.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

struct Cell {
  std::string text;
  bool isQuoted = false;
};

// The lines of a text, each ended by CR LF.
std::vector<std::vector<Cell>> linesOfCsv(const std::string& text, const std::string& name) {
  std::vector<std::vector<Cell>> lines(1, std::vector<Cell>(1));
  bool isOpen = false;
  for (std::size_t i = 0; i < text.size(); ++i) {
    Cell& cell = lines.back().back();
    const char c = text[i];
    if (isOpen && c == '"' && i + 1 < text.size() && text[i + 1] == '"') {
      cell.text += text[++i];
    } else if (c == '"') {
      EXPECT_TRUE(isOpen || cell.text.empty()) << name << ": a quote within a cell";
      isOpen = !isOpen;
      cell.isQuoted = true;
    } else if (isOpen) {
      cell.text += c;
    } else if (c == ',') {
      lines.back().emplace_back();
    } else if (c == '\r') {
      EXPECT_TRUE(i + 1 < text.size() && text[i + 1] == '\n') << name << ": CR without LF";
      ++i;
      lines.emplace_back(1);
    } else {
      EXPECT_NE(c, '\n') << name << ": LF without CR";
      cell.text += c;
    }
  }
  EXPECT_FALSE(isOpen) << name << ": an open quote";
  EXPECT_EQ(lines.back().size(), 1U) << name << " ends within a line";
  lines.pop_back();
  return lines;
}

ExportedTable tableOf(const std::vector<std::vector<Cell>>& lines, const std::string& name) {
  ExportedTable table;
  for (const Cell& cell : lines.at(0)) {
    const auto unit = cell.text.find(" [");
    table.header.push_back(cell.text.substr(0, unit));
    if (unit == std::string::npos) continue;
    EXPECT_TRUE(cell.text.ends_with(']')) << cell.text;
    table.units[table.header.back()] = cell.text.substr(unit + 2, cell.text.size() - unit - 3);
  }
  for (std::size_t i = 1; i < lines.size(); ++i) {
    EXPECT_EQ(lines[i].size(), table.header.size()) << name << ", line " << i;
    ExportedRow row;
    for (std::size_t c = 0; c < lines[i].size() && c < table.header.size(); ++c) {
      const Cell& cell = lines[i][c];
      if (!cell.text.empty() || cell.isQuoted) row[table.header[c]] = cell.text;
    }
    table.rows.push_back(row);
  }
  return table;
}

struct Close {
  void operator()(sqlite3* database) const { sqlite3_close(database); }
  void operator()(sqlite3_stmt* statement) const { sqlite3_finalize(statement); }
};
using Statement = std::unique_ptr<sqlite3_stmt, Close>;

Statement ask(sqlite3* database, const std::string& sql) {
  sqlite3_stmt* statement = nullptr;
  EXPECT_EQ(sqlite3_prepare_v2(database, sql.c_str(), -1, &statement, nullptr), SQLITE_OK)
      << sql << ": " << sqlite3_errmsg(database);
  return Statement(statement);
}

std::string textAt(sqlite3_stmt* statement, int column) {
  const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(statement, column));
  return {text, static_cast<std::size_t>(sqlite3_column_bytes(statement, column))};
}

std::optional<std::string> cellAt(sqlite3_stmt* statement, int column, const std::string& name) {
  const std::string declared = sqlite3_column_decltype(statement, column);
  switch (sqlite3_column_type(statement, column)) {
    case SQLITE_NULL:
      return std::nullopt;
    case SQLITE_INTEGER:
      EXPECT_EQ(declared, "INTEGER") << name;
      return std::to_string(sqlite3_column_int64(statement, column));
    case SQLITE_FLOAT:
      EXPECT_EQ(declared, "REAL") << name;
      return jsonText(Value(static_cast<float>(sqlite3_column_double(statement, column))));
    case SQLITE_BLOB: {
      EXPECT_EQ(declared, "BLOB") << name;
      const auto* bytes = static_cast<const std::uint8_t*>(sqlite3_column_blob(statement, column));
      const auto size = static_cast<std::size_t>(sqlite3_column_bytes(statement, column));
      return cellText(Value(size == 0 ? Bytes() : Bytes(bytes, bytes + size)));
    }
    default:
      EXPECT_EQ(declared, "TEXT") << name;
      return textAt(statement, column);
  }
}

ExportedTable tableOf(sqlite3* database, const std::string& name) {
  ExportedTable table;
  const Statement rows = ask(database, "SELECT * FROM \"" + name + "\" ORDER BY rowid");
  const int columns = sqlite3_column_count(rows.get());
  for (int i = 0; i < columns; ++i) {
    table.header.emplace_back(sqlite3_column_name(rows.get(), i));
    if (std::string_view(sqlite3_column_decltype(rows.get(), i)) == "TEXT") {
      table.texts.insert(table.header.back());
    }
  }
  while (sqlite3_step(rows.get()) == SQLITE_ROW) {
    ExportedRow row;
    for (int i = 0; i < columns; ++i) {
      const std::string& column = table.header[static_cast<std::size_t>(i)];
      if (auto cell = cellAt(rows.get(), i, name + "." + column)) row[column] = *cell;
    }
    table.rows.push_back(row);
  }
  return table;
}

}  // namespace

ExportedTables readCsv(const std::string& folder) {
  ExportedTables tables;
  for (const auto& entry : fs::directory_iterator(folder)) {
    EXPECT_EQ(entry.path().extension(), ".csv") << entry.path();
    std::ifstream stream(entry.path(), std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(stream), {}};
    const std::string name = entry.path().stem().string();
    tables[name] = tableOf(linesOfCsv(text, name), name);
  }
  return tables;
}

ExportedTables readSqlite(const std::string& path) {
  sqlite3* opened = nullptr;
  EXPECT_EQ(sqlite3_open_v2(path.c_str(), &opened, SQLITE_OPEN_READONLY, nullptr), SQLITE_OK);
  const std::unique_ptr<sqlite3, Close> database(opened);
  ExportedTables tables;
  const Statement names =
      ask(opened, "SELECT name FROM sqlite_schema WHERE type = 'table' AND name <> 'units'");
  while (sqlite3_step(names.get()) == SQLITE_ROW) {
    const std::string name = textAt(names.get(), 0);
    tables[name] = tableOf(opened, name);
  }
  const Statement units = ask(opened, "SELECT * FROM units");
  while (sqlite3_step(units.get()) == SQLITE_ROW) {
    tables[textAt(units.get(), 0)].units[textAt(units.get(), 1)] = textAt(units.get(), 2);
  }
  return tables;
}

}  // namespace qel::testing
