// An SQLite database of this program's own.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>

struct sqlite3;
struct sqlite3_stmt;

namespace qel::fleet {

// One thread at a time. Statements are prepared once and kept.
class Database {
 public:
  // A statement under way, given back by its end.
  class Run {
   public:
    Run(Database& database, sqlite3_stmt* statement)
        : _database(database), _statement(statement), _hasFailed(!statement) {}
    ~Run();
    Run(const Run&) = delete;
    Run& operator=(const Run&) = delete;

    Run& with(std::uint64_t number);
    Run& with(std::string_view text);  // must outlive this
    // Whether there is another row. False, too, when the statement failed.
    bool row();
    // False when it failed.
    bool done();
    bool hasFailed() const { return _hasFailed; }
    std::uint64_t number(int column) const;
    std::string text(int column) const;

   private:
    Database& _database;
    sqlite3_stmt* const _statement;
    int _place = 0;
    bool _hasFailed;
  };

  // For this user's eyes alone. False when it cannot be opened.
  bool open(const std::string& path);
  bool execute(const std::string& sql);
  // Of a text that outlives this.
  Run run(const char* sql);
  // Waits until what was committed, in its write-ahead log, outlives a failure of power.
  bool sync();

  // Undoes a transaction that has failed, and keeps why. Always false.
  bool rollBack();
  // For what is wrong with the content. Always false.
  bool fail(const std::string& why);

  // One line, "FILE: WHY", of what failed last; empty: nothing has.
  const std::string& error() const { return _error; }

 private:
  struct CloseDatabase {
    void operator()(sqlite3* database) const;
  };
  struct EndStatement {
    void operator()(sqlite3_stmt* statement) const;
  };
  bool fail();

  std::string _path;
  std::unique_ptr<sqlite3, CloseDatabase> _database;
  std::map<const char*, std::unique_ptr<sqlite3_stmt, EndStatement>> _statements;
  std::string _error;
};

}  // namespace qel::fleet
