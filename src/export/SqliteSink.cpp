#include "export/SqliteSink.h"

#include <sqlite3.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <string_view>

#include "base/Rendering.h"

namespace qel {
namespace {

constexpr std::size_t kRowsOfATransaction = 4096;
constexpr std::string_view kUnits = "units";

// A name within SQL.
std::string named(std::string_view name) {
  std::string text = "\"";
  for (const char c : name) {
    if (c == '"') text += '"';
    text += c;
  }
  return text + '"';
}

std::string_view sqlType(ColumnType type) {
  constexpr std::array<std::string_view, 4> kTypes = {"INTEGER", "REAL", "TEXT", "BLOB"};
  return kTypes[static_cast<std::size_t>(type)];
}

std::string creationOf(const Table& table) {
  std::string columns;
  for (const Column& column : table.columns) {
    if (!columns.empty()) columns += ", ";
    columns += named(column.name) + " " + std::string(sqlType(column.type));
  }
  return "CREATE TABLE " + named(table.name) + " (" + columns + ")";
}

std::string insertionOf(const Table& table) {
  std::string places;
  for (std::size_t i = 0; i < table.columns.size(); ++i) places += i == 0 ? "?" : ", ?";
  return "INSERT INTO " + named(table.name) + " VALUES (" + places + ")";
}

void bindText(sqlite3_stmt* statement, int place, std::string_view text) {
  sqlite3_bind_text64(statement, place, text.data(), text.size(), SQLITE_TRANSIENT, SQLITE_UTF8);
}

void bind(sqlite3_stmt* statement, int place, const Value& value) {
  if (const auto integer = value.asInt64()) {
    sqlite3_bind_int64(statement, place, *integer);
  } else if (value.kind() == Value::Kind::floating) {
    // As its shortest text says: a float's own digits go on beyond what it tells.
    sqlite3_bind_double(statement, place, std::strtod(jsonText(value).c_str(), nullptr));
  } else if (const Bytes* bytes = value.asBytes()) {
    // Without data there would be nothing instead of no bytes.
    sqlite3_bind_blob64(statement, place,
                        bytes->empty() ? "" : static_cast<const void*>(bytes->data()),
                        bytes->size(), SQLITE_TRANSIENT);
  } else if (value.isNull()) {
    sqlite3_bind_null(statement, place);
  } else {
    bindText(statement, place, cellText(value));
  }
}

}  // namespace

void SqliteSink::CloseDatabase::operator()(sqlite3* database) const { sqlite3_close(database); }
void SqliteSink::EndStatement::operator()(sqlite3_stmt* statement) const {
  sqlite3_finalize(statement);
}

std::unique_ptr<SqliteSink> SqliteSink::create(const std::string& path, bool replaces,
                                               std::string& error) {
  if (!replaces && ::access(path.c_str(), F_OK) == 0) {
    error = path + ": " + std::strerror(EEXIST);
    return nullptr;
  }
  std::unique_ptr<SqliteSink> sink(new SqliteSink(path));
  if (sink->open()) return sink;
  error = sink->error();
  return nullptr;
}

SqliteSink::~SqliteSink() = default;

bool SqliteSink::fail() {
  _error = _file.path() + ": " + (_database ? sqlite3_errmsg(_database.get()) : "out of memory");
  return false;
}

// The library opens the file that is made here with its owner's rights alone. Should the program
// end before all is done, the file is in nobody's way: no journal is needed.
bool SqliteSink::open() {
  if (!_file.create()) {
    _error = _file.error();
    return false;
  }
  sqlite3* database = nullptr;
  const int code = sqlite3_open_v2(_file.partPath().c_str(), &database,
                                   SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX, nullptr);
  _database.reset(database);
  if (code != SQLITE_OK) return fail();
  if (!execute("PRAGMA journal_mode = OFF") || !execute("PRAGMA synchronous = OFF")) return false;
  if (!execute("CREATE TABLE " + named(kUnits) +
               R"( ("table" TEXT, "column" TEXT, "unit" TEXT))")) {
    return false;
  }
  _unit = prepare("INSERT INTO " + named(kUnits) + " VALUES (?, ?, ?)");
  return _unit && execute("BEGIN");
}

bool SqliteSink::execute(const std::string& sql) {
  return sqlite3_exec(_database.get(), sql.c_str(), nullptr, nullptr, nullptr) == SQLITE_OK ||
         fail();
}

SqliteSink::Statement SqliteSink::prepare(const std::string& sql) {
  sqlite3_stmt* statement = nullptr;
  const int code = sqlite3_prepare_v2(_database.get(), sql.c_str(), -1, &statement, nullptr);
  if (code != SQLITE_OK) fail();
  return Statement(statement);
}

bool SqliteSink::step(sqlite3_stmt* statement) {
  const int code = sqlite3_step(statement);
  if (code != SQLITE_DONE) return fail();
  return sqlite3_reset(statement) == SQLITE_OK || fail();
}

sqlite3_stmt* SqliteSink::insertionInto(const Table& table) {
  if (!_error.empty()) return nullptr;
  Statement& insertion = _insertions[&table];
  if (insertion) return insertion.get();
  if (!execute(creationOf(table))) return nullptr;
  for (const Column& column : table.columns) {
    if (column.unit.empty()) continue;
    bindText(_unit.get(), 1, table.name);
    bindText(_unit.get(), 2, column.name);
    bindText(_unit.get(), 3, column.unit);
    if (!step(_unit.get())) return nullptr;
  }
  insertion = prepare(insertionOf(table));
  return insertion.get();
}

bool SqliteSink::put(const Table& table, const TableRow& row) {
  sqlite3_stmt* insertion = insertionInto(table);
  if (!insertion) return false;
  for (std::size_t i = 0; i < row.size(); ++i) bind(insertion, static_cast<int>(i) + 1, row[i]);
  if (!step(insertion)) return false;
  if (++_rowsInTransaction < kRowsOfATransaction) return true;
  _rowsInTransaction = 0;
  return execute("COMMIT") && execute("BEGIN");
}

bool SqliteSink::finish() {
  if (!_error.empty()) return false;
  for (const auto& [table, insertion] : _insertions) {
    if (!execute("CREATE INDEX " + named("time of " + table->name) + " ON " + named(table->name) +
                 " (" + named(table->columns.front().name) + ")")) {
      return false;
    }
  }
  if (!execute("COMMIT")) return false;
  _unit.reset();
  _insertions.clear();
  _database.reset();
  if (_file.complete() && _file.takePlace()) return true;
  _error = _file.error();
  return false;
}

}  // namespace qel
