// What tables a database has.
#pragma once

#include <map>
#include <pqxx/pqxx>
#include <string>

namespace qel::fleet {

// Table, column, type; of the schema, without partitions. Empty where there is no schema.
using FoundTables = std::map<std::string, std::map<std::string, std::string>>;
FoundTables foundTables(pqxx::transaction_base& transaction);

// Of the tables; 0: they were never made.
int foundLayout(pqxx::transaction_base& transaction);

}  // namespace qel::fleet
