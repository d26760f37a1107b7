#include "fleet/collect/Preparation.h"

#include <pqxx/pqxx>

#include "fleet/collect/FleetSchema.h"
#include "fleet/collect/SchemaLook.h"

namespace qel::fleet {
namespace {

std::string layoutText(int layout) { return "layout " + std::to_string(layout); }

// One run of this at a time.
class Preparation {
 public:
  Preparation(pqxx::transaction_base& transaction, Prepared& prepared)
      : _transaction(transaction), _prepared(prepared) {}

  void run() {
    _transaction.exec("SELECT pg_advisory_xact_lock(hashtext('qelwatch.prepare'))");
    const int layout = foundLayout(_transaction);
    if (layout > kLayout) {
      throw WrongLayout("its tables have " + layoutText(layout) + ", this program knows " +
                        layoutText(kLayout));
    }
    _found = foundTables(_transaction);
    const Partitions partitions = choosePartitions();
    _transaction.exec("CREATE SCHEMA IF NOT EXISTS qelwatch");
    _transaction.exec(
        "CREATE TABLE IF NOT EXISTS qelwatch.version"
        " (layout integer NOT NULL, made timestamptz NOT NULL DEFAULT now())");
    for (const SchemaTable& table : schemaTables()) makeTable(table, partitions);
    _transaction.exec(functions(partitions));
    _transaction.exec(views());
    _transaction.exec(roles());
    _transaction.exec(rights());
    if (layout == 0) {
      _transaction.exec("INSERT INTO qelwatch.version (layout) VALUES (" + std::to_string(kLayout) +
                        ")");
    }
  }

 private:
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
      _transaction.exec(creationOf(table, partitions));
      ++_prepared.tables;
    } else {
      for (const SchemaColumn& column : table.columns) makeColumn(table, column, found->second);
    }
    _transaction.exec(commentsOf(table));
  }

  void makeColumn(const SchemaTable& table, const SchemaColumn& column,
                  const FoundTables::mapped_type& found) {
    const auto there = found.find(column.name);
    if (there == found.end()) {
      _transaction.exec("ALTER TABLE " + withSchema(table.name) + " ADD COLUMN " +
                        definitionOf(column));
      ++_prepared.columns;
    } else if (there->second != column.type) {
      throw WrongLayout(withSchema(table.name) + " has " + there->second + " as " + column.name +
                        ", not " + column.type);
    }
  }

  pqxx::transaction_base& _transaction;
  Prepared& _prepared;
  FoundTables _found;
};

}  // namespace

bool prepareDatabase(const std::string& address, Prepared& prepared, DatabaseTrouble& trouble) {
  return guarded(
      [&] {
        pqxx::connection connection(address);
        {
          pqxx::work transaction(connection);
          transaction.exec("SET LOCAL client_min_messages = warning");
          Preparation(transaction, prepared).run();
          transaction.commit();
        }
        for (const char* day : {"0", "1"}) {
          pqxx::work transaction(connection);
          transaction.exec("SELECT qelwatch.make_day((now() AT TIME ZONE 'UTC')::date + " +
                           std::string(day) + ")");
          transaction.commit();
        }
      },
      trouble);
}

}  // namespace qel::fleet
