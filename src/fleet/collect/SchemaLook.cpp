#include "fleet/collect/SchemaLook.h"

namespace qel::fleet {

FoundTables foundTables(pqxx::transaction_base& transaction) {
  FoundTables tables;
  const auto rows = transaction.exec(
      "SELECT c.relname, a.attname, format_type(a.atttypid, a.atttypmod)"
      " FROM pg_namespace AS n JOIN pg_class AS c ON c.relnamespace = n.oid"
      " JOIN pg_attribute AS a ON a.attrelid = c.oid"
      " WHERE n.nspname = 'qelwatch' AND c.relkind IN ('r', 'p') AND NOT c.relispartition"
      " AND a.attnum > 0 AND NOT a.attisdropped");
  for (const auto& row : rows) tables[row[0].c_str()][row[1].c_str()] = row[2].c_str();
  return tables;
}

int foundLayout(pqxx::transaction_base& transaction) {
  if (transaction.exec1("SELECT to_regclass('qelwatch.version') IS NULL")[0].as<bool>()) return 0;
  return transaction.exec1("SELECT coalesce(max(layout), 0) FROM qelwatch.version")[0].as<int>();
}

}  // namespace qel::fleet
