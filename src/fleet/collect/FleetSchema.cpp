#include "fleet/collect/FleetSchema.h"

#include <utility>

#include "messages/catalogue/FieldFacts.h"

namespace qel::fleet {
namespace {

constexpr const char* kTime = "timestamp with time zone";
constexpr const char* kNeeded = "NOT NULL";
constexpr const char* kNow = "NOT NULL DEFAULT now()";

std::vector<SchemaColumn> keyColumns() {
  return {{"phone", "text", kNeeded},
          {"stream", "bigint", kNeeded},
          {"number", "bigint", kNeeded},
          {"time", kTime, kNeeded}};
}

SchemaTable eventTable() {
  SchemaTable table{"event", keyColumns(), "PRIMARY KEY (phone, time, stream, number)",
                    "Every event that a phone has numbered."};
  table.columns.push_back({"metric", "text", kNeeded});
  table.columns.push_back({"received", kTime, kNow});
  table.columns.push_back({"fault", "text"});
  table.columns.push_back({"content", "jsonb"});
  return table;
}

SchemaTable tableOf(const FleetTable& fleetTable) {
  SchemaTable table{fleetTable.name(), keyColumns(), "", ""};
  if (const MessageFacts* facts = findMessageFacts(fleetTable.metric().className)) {
    table.meaning = facts->meaning;
  }
  for (const FleetColumn& column : fleetTable.columns()) {
    table.columns.push_back({column.name, std::string(column.sqlType), "", column.unit});
  }
  return table;
}

std::vector<SchemaTable> tablesOfPhones() {
  const SchemaColumn phone{"phone", "text", kNeeded};
  const SchemaColumn time{"time", kTime, kNow};
  const auto number = [](const char* name) { return SchemaColumn{name, "bigint", kNeeded}; };
  SchemaTable phones{"phone",
                     {{"phone", "text", "PRIMARY KEY"}, {"first_seen", kTime, kNow}},
                     "",
                     "Every phone of which an event has come.",
                     false};
  SchemaTable status{"status",
                     {phone, time, {"status", "text", kNeeded}},
                     "",
                     "When a phone came and went, by the database's clock.",
                     false};
  // Collectors that know nothing of a column that came later say nothing of it.
  const SchemaColumn tooLarge{"too_large", "bigint", "NOT NULL DEFAULT 0"};
  SchemaTable queue{"queue",
                    {phone, time, number("stream"), number("dropped"), number("lost"), tooLarge,
                     number("undecodable")},
                    "",
                    "What phones say of events that will never come.",
                    false};
  return {std::move(phones), std::move(status), std::move(queue)};
}

std::vector<SchemaTable> makeSchemaTables() {
  std::vector<SchemaTable> tables = {eventTable()};
  for (const FleetTable& table : fleetTables()) tables.push_back(tableOf(table));
  for (SchemaTable& table : tablesOfPhones()) tables.push_back(std::move(table));
  return tables;
}

std::string index(const SchemaTable& table, std::string_view how) {
  return "CREATE INDEX ON " + withSchema(table.name) + " " + std::string(how) + ";\n";
}

}  // namespace

const std::vector<SchemaTable>& schemaTables() {
  static const std::vector<SchemaTable> kTables = makeSchemaTables();
  return kTables;
}

std::string quotedText(std::string_view text) {
  std::string quoted = "'";
  for (const char c : text) {
    if (c == '\'') quoted += '\'';
    quoted += c;
  }
  return quoted + "'";
}

std::string withSchema(std::string_view name) {
  return std::string(kSchema) + "." + std::string(name);
}

std::string quotedName(std::string_view name) { return '"' + std::string(name) + '"'; }

std::string definitionOf(const SchemaColumn& column) {
  return quotedName(column.name) + " " + column.type + " " + column.more;
}

std::string creationOf(const SchemaTable& table, Partitions partitions) {
  std::string parts;
  for (const SchemaColumn& column : table.columns) {
    if (!parts.empty()) parts += ", ";
    parts += definitionOf(column);
  }
  if (!table.constraints.empty()) parts += ", " + table.constraints;
  const std::string name = withSchema(table.name);
  const bool hasDays = table.isOfEvents && partitions == Partitions::days;
  std::string sql = "CREATE TABLE " + name + " (" + parts + ")" +
                    (hasDays ? " PARTITION BY RANGE (time);\n" : ";\n");
  if (!table.isOfEvents) {
    if (table.name != "phone") sql += index(table, "(phone, time)");
    return sql;
  }
  if (table.constraints.empty()) sql += index(table, "(phone, time)");
  sql += index(table, "USING brin (time)");
  if (hasDays) {
    sql += "CREATE TABLE " + name + "_default PARTITION OF " + name + " DEFAULT;\n";
  } else {
    sql += "SELECT create_hypertable(" + quotedText(name) +
           ", 'time', chunk_time_interval => interval '1 day', create_default_indexes => false);\n";
  }
  return sql;
}

std::string commentsOf(const SchemaTable& table) {
  const std::string name = withSchema(table.name);
  std::string sql = "COMMENT ON TABLE " + name + " IS " + quotedText(table.meaning) + ";\n";
  for (const SchemaColumn& column : table.columns) {
    if (column.unit.empty()) continue;
    sql += "COMMENT ON COLUMN " + name + "." + quotedName(column.name) + " IS " +
           quotedText(column.unit) + ";\n";
  }
  return sql;
}

std::string roles() {
  std::string sql;
  for (const std::string_view role : {kCollectorRole, kReaderRole}) {
    sql += "DO $$ BEGIN IF NOT EXISTS (SELECT FROM pg_roles WHERE rolname = " + quotedText(role) +
           ") THEN CREATE ROLE " + std::string(role) + " NOLOGIN; END IF; END $$;\n";
  }
  return sql;
}

std::string rights() {
  std::string tables;
  for (const SchemaTable& table : schemaTables()) {
    if (!tables.empty()) tables += ", ";
    tables += withSchema(table.name);
  }
  const std::string schema(kSchema);
  const std::string collector(kCollectorRole);
  const std::string both = collector + ", " + std::string(kReaderRole);
  const std::string views =
      "qelwatch.version, qelwatch.phones, qelwatch.streams,"
      " qelwatch.lte_cell_changes, qelwatch.rejects";
  return "REVOKE ALL ON SCHEMA " + schema + " FROM PUBLIC;\n" +  //
         "REVOKE ALL ON ALL TABLES IN SCHEMA " + schema + " FROM PUBLIC, " + both + ";\n" +
         "REVOKE ALL ON ALL FUNCTIONS IN SCHEMA " + schema + " FROM PUBLIC, " + both + ";\n" +
         "GRANT USAGE ON SCHEMA " + schema + " TO " + both + ";\n" +  //
         "GRANT SELECT ON " + tables + ", " + views + " TO " + both + ";\n" + "GRANT INSERT ON " +
         tables + " TO " + collector + ";\n" +
         "GRANT EXECUTE ON FUNCTION qelwatch.make_day(date) TO " + collector + ";\n";
}

}  // namespace qel::fleet
