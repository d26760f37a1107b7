// What stands in the database: as SQL.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "fleet/collect/FleetTable.h"

namespace qel::fleet {

// One more for each change that is more than a new table or a new column.
inline constexpr int kLayout = 1;
inline constexpr std::string_view kCollectorRole = "qelwatch_collector";
inline constexpr std::string_view kReaderRole = "qelwatch_reader";
// Days that have partitions of their own, before and after today.
inline constexpr int kDaysBack = 31;
inline constexpr int kDaysAhead = 2;

enum class Partitions : std::uint8_t { days, hypertables };

struct SchemaColumn {
  std::string name;
  std::string type;       // as the database calls it
  std::string more = {};  // of its definition
  std::string unit = {};  // empty: none
};

struct SchemaTable {
  std::string name;
  std::vector<SchemaColumn> columns;
  std::string constraints;  // within its creation; empty: none
  std::string meaning;
  bool isOfEvents = true;  // has a "time" of events, and so days
};

// All tables but the one of the version, in the order in which they are made.
const std::vector<SchemaTable>& schemaTables();

std::string quotedText(std::string_view text);
// "qelwatch.name"; names here need no quotes.
std::string withSchema(std::string_view name);
std::string quotedName(std::string_view name);

std::string definitionOf(const SchemaColumn& column);
// Statements, each of which can be repeated but for the creation of a table.
std::string creationOf(const SchemaTable& table, Partitions partitions);
std::string commentsOf(const SchemaTable& table);
std::string functions(Partitions partitions);
std::string views();
std::string roles();
std::string rights();

}  // namespace qel::fleet
