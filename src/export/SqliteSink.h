// Tables in an SQLite database.
#pragma once

#include <map>
#include <memory>
#include <string>

#include "export/PartFile.h"
#include "export/Table.h"

struct sqlite3;
struct sqlite3_stmt;

namespace qel {

// A table each, with typed columns (INTEGER, REAL, TEXT, BLOB) and an index on its first one, which
// is the time; beside them the table "units" of table, name and unit of each column that has one.
class SqliteSink final : public TableSink {
 public:
  // Without `replaces` the file must not be there. Nothing when it cannot be begun; `error` is then
  // one line.
  static std::unique_ptr<SqliteSink> create(const std::string& path, bool replaces,
                                            std::string& error);
  ~SqliteSink() override;

  bool make(const Table& table) override { return insertionInto(table) != nullptr; }
  bool put(const Table& table, const TableRow& row) override;
  bool finish() override;
  const std::string& error() const override { return _error; }

 private:
  struct CloseDatabase {
    void operator()(sqlite3* database) const;
  };
  struct EndStatement {
    void operator()(sqlite3_stmt* statement) const;
  };
  using Statement = std::unique_ptr<sqlite3_stmt, EndStatement>;

  explicit SqliteSink(std::string path) : _file(std::move(path)) {}
  bool open();
  bool execute(const std::string& sql);
  Statement prepare(const std::string& sql);
  sqlite3_stmt* insertionInto(const Table& table);
  bool step(sqlite3_stmt* statement);
  bool fail();

  PartFile _file;
  std::unique_ptr<sqlite3, CloseDatabase> _database;
  std::map<const Table*, Statement> _insertions;
  Statement _unit;
  std::size_t _rowsInTransaction = 0;
  std::string _error;
};

}  // namespace qel
