#include "fleet/Database.h"

#include <fcntl.h>
#include <sqlite3.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

namespace qel::fleet {

void Database::CloseDatabase::operator()(sqlite3* database) const { sqlite3_close(database); }
void Database::EndStatement::operator()(sqlite3_stmt* statement) const {
  sqlite3_finalize(statement);
}

bool Database::fail() {
  const int code = _database ? sqlite3_errcode(_database.get()) : SQLITE_NOMEM;
  return fail(code == SQLITE_BUSY ? "is used by another process"
              : _database         ? sqlite3_errmsg(_database.get())
                                  : "out of memory");
}

bool Database::fail(const std::string& why) {
  _error = _path + ": " + why;
  return false;
}

bool Database::rollBack() {
  if (sqlite3_get_autocommit(_database.get()) == 0) {
    sqlite3_exec(_database.get(), "ROLLBACK", nullptr, nullptr, nullptr);
  }
  return false;
}

bool Database::open(const std::string& path) {
  _path = path;
  // The library would let everybody read what it makes.
  const int file = ::open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600);
  if (file < 0) {
    _error = path + ": " + std::strerror(errno);
    return false;
  }
  ::close(file);
  sqlite3* database = nullptr;
  const int code = sqlite3_open_v2(path.c_str(), &database,
                                   SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX, nullptr);
  _database.reset(database);
  return code == SQLITE_OK || fail();
}

bool Database::execute(const std::string& sql) {
  return sqlite3_exec(_database.get(), sql.c_str(), nullptr, nullptr, nullptr) == SQLITE_OK ||
         fail();
}

bool Database::sync() {
  sqlite3_file* log = nullptr;
  sqlite3_file_control(_database.get(), "main", SQLITE_FCNTL_JOURNAL_POINTER, &log);
  const bool isSynced = !log || !log->pMethods ||  // nothing was written so far
                        log->pMethods->xSync(log, SQLITE_SYNC_NORMAL) == SQLITE_OK;
  return isSynced || fail("cannot be brought to the disk");
}

Database::Run Database::run(const char* sql) {
  auto& statement = _statements[sql];
  if (!statement) {
    sqlite3_stmt* made = nullptr;
    if (sqlite3_prepare_v3(_database.get(), sql, -1, SQLITE_PREPARE_PERSISTENT, &made, nullptr) !=
        SQLITE_OK) {
      fail();
    }
    statement.reset(made);
  }
  return {*this, statement.get()};
}

Database::Run::~Run() {
  if (!_statement) return;
  sqlite3_reset(_statement);
  sqlite3_clear_bindings(_statement);
}

Database::Run& Database::Run::with(std::uint64_t number) {
  if (_statement) {
    sqlite3_bind_int64(_statement, ++_place, static_cast<std::int64_t>(number));
  }
  return *this;
}

Database::Run& Database::Run::with(std::string_view text) {
  if (_statement) {
    sqlite3_bind_text64(_statement, ++_place, text.data(), text.size(), SQLITE_STATIC, SQLITE_UTF8);
  }
  return *this;
}

bool Database::Run::row() {
  if (_hasFailed) return false;
  const int code = sqlite3_step(_statement);
  _hasFailed = code != SQLITE_ROW && code != SQLITE_DONE;
  if (_hasFailed) _database.fail();
  return code == SQLITE_ROW;
}

bool Database::Run::done() {
  while (row()) {
  }
  return !_hasFailed;
}

std::uint64_t Database::Run::number(int column) const {
  return static_cast<std::uint64_t>(sqlite3_column_int64(_statement, column));
}

std::string Database::Run::text(int column) const {
  const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(_statement, column));
  return text
             ? std::string(text, static_cast<std::size_t>(sqlite3_column_bytes(_statement, column)))
             : std::string();
}

}  // namespace qel::fleet
