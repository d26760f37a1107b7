#include "fleet/collect/Preparation.h"

#include <memory>
#include <pqxx/pqxx>

#include "fleet/collect/FleetSchema.h"
#include "fleet/collect/SchemaLook.h"
#include "fleet/collect/WatchedConnection.h"

namespace qel::fleet {
namespace {

std::string layoutText(int layout) { return "layout " + std::to_string(layout); }

// One run of this at a time.
class Preparation {
 public:
  Preparation(WatchedConnection& connection, pqxx::transaction_base& transaction,
              Prepared& prepared)
      : _connection(connection), _transaction(transaction), _prepared(prepared) {}

  void run() {
    exec("SELECT pg_advisory_xact_lock(hashtext('qelwatch.prepare'))");
    const int layout = foundLayout(_transaction);
    if (layout > kLayout) {
      throw WrongLayout("its tables have " + layoutText(layout) + ", this program knows " +
                        layoutText(kLayout));
    }
    _found = foundTables(_transaction);
    const Partitions partitions = choosePartitions();
    exec("CREATE SCHEMA IF NOT EXISTS qelwatch");
    exec(
        "CREATE TABLE IF NOT EXISTS qelwatch.version"
        " (layout integer NOT NULL, made timestamptz NOT NULL DEFAULT now())");
    for (const SchemaTable& table : schemaTables()) makeTable(table, partitions);
    exec(functions(partitions));
    exec(views());
    exec(roles());
    exec(rights());
    if (layout == 0) {
      exec("INSERT INTO qelwatch.version (layout) VALUES (" + std::to_string(kLayout) + ")");
    }
  }

 private:
  // What follows has all of its time, however long this one took.
  void exec(const std::string& statement) {
    _transaction.exec(statement);
    _connection.expectAnswer();
  }

  bool isTrue(const std::string& question) {
    return _transaction.exec1("SELECT EXISTS (" + question + ")")[0].as<bool>();
  }

  // What there is stays as it is.
  Partitions choosePartitions() {
    const bool areDays =
        isTrue("SELECT FROM pg_class WHERE oid = to_regclass('qelwatch.event') AND relkind = 'p'");
    const bool hasExtension = isTrue("SELECT FROM pg_extension WHERE extname = 'timescaledb'");
    _prepared.hasHypertables = hasExtension && !areDays;
    _prepared.couldHaveHypertables =
        !hasExtension && _found.empty() &&
        isTrue("SELECT FROM pg_available_extensions WHERE name = 'timescaledb'");
    return _prepared.hasHypertables ? Partitions::hypertables : Partitions::days;
  }

  void makeTable(const SchemaTable& table, Partitions partitions) {
    const auto found = _found.find(table.name);
    if (found == _found.end()) {
      exec(creationOf(table, partitions));
      ++_prepared.tables;
    } else {
      for (const SchemaColumn& column : table.columns) makeColumn(table, column, found->second);
    }
    exec(commentsOf(table));
  }

  void makeColumn(const SchemaTable& table, const SchemaColumn& column,
                  const FoundTables::mapped_type& found) {
    const auto there = found.find(column.name);
    if (there == found.end()) {
      exec("ALTER TABLE " + withSchema(table.name) + " ADD COLUMN " + definitionOf(column));
      ++_prepared.columns;
    } else if (there->second != column.type) {
      throw WrongLayout(withSchema(table.name) + " has " + there->second + " as " + column.name +
                        ", not " + column.type);
    }
  }

  WatchedConnection& _connection;
  pqxx::transaction_base& _transaction;
  Prepared& _prepared;
  FoundTables _found;
};

}  // namespace

bool prepareDatabase(const std::string& address, const AnswerPatience& patience, Prepared& prepared,
                     DatabaseTrouble& trouble) {
  std::unique_ptr<WatchedConnection> connection;
  const auto connect = [&] { connection = std::make_unique<WatchedConnection>(address, patience); };
  const auto prepare = [&] {
    {
      pqxx::work transaction(connection->library());
      transaction.exec("SET client_min_messages = warning");
      transaction.exec("SET statement_timeout = " + std::to_string(patience.statement.count()));
      Preparation(*connection, transaction, prepared).run();
      transaction.commit();
    }
    for (const char* day : {"0", "1"}) {
      connection->expectAnswer();
      pqxx::work transaction(connection->library());
      transaction.exec("SELECT qelwatch.make_day((now() AT TIME ZONE 'UTC')::date + " +
                       std::string(day) + ")");
      transaction.commit();
    }
  };
  return guarded(connect, trouble) && connection->answersTo(prepare, trouble);
}

}  // namespace qel::fleet
