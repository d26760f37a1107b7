// What stands in the tables is what the other subcommands make of the same events.
#include <map>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>

#include "bus/ServiceProcess.h"
#include "fleet/collect/FleetTable.h"
#include "fleet/collect/WithDatabase.h"
#include "support/PrivateBus.h"

namespace qel::testing {
namespace {

using Json = nlohmann::json;
using fleet::FleetColumn;
using fleet::FleetTable;

constexpr std::size_t kEvents = 1500;

// A column as text, the same of both databases.
std::string ofPostgres(const FleetColumn& column) {
  const std::string name = '"' + column.name + '"';
  if (column.isTime) {
    return "to_char(" + name + " AT TIME ZONE 'UTC', 'YYYY-MM-DD\"T\"HH24:MI:SS.MS\"Z\"')";
  }
  if (column.type == ColumnType::bytes) return "encode(" + name + ", 'hex')";
  return column.type == ColumnType::real ? "round(" + name + " * 1000)" : name;
}

std::string ofSqlite(const FleetColumn& column, const std::string& name) {
  if (column.type == ColumnType::bytes) return "lower(hex(\"" + name + "\"))";
  if (column.type == ColumnType::real) {
    return "CAST(round(\"" + name + "\" * 1000) AS INTEGER)";
  }
  return '"' + name + '"';
}

// What the dispatcher says of each metric's reports, in their order.
std::map<std::uint32_t, std::vector<Json>> saidBy(const std::string& replayed) {
  constexpr std::uint32_t kEventBase = 0x3C0000;
  std::map<std::uint32_t, std::vector<Json>> said;
  std::istringstream lines(replayed);
  std::uint32_t metric = 0;
  for (std::string line; std::getline(lines, line);) {
    const std::string start = "Metric ID in Hex = ";
    if (line.starts_with(start)) {
      metric = static_cast<std::uint32_t>(std::stoul(line.substr(start.size()), nullptr, 16)) -
               kEventBase;
    }
    const auto brace = line.find('{');
    if (brace != std::string::npos) said[metric].push_back(Json::parse(line.substr(brace)));
  }
  return said;
}

std::string textOf(const Json& value) {
  if (value.is_string()) return value.get<std::string>();
  if (value.is_boolean()) return value.get<bool>() ? "1" : "0";
  return value.dump();
}

class CollectAgreement : public WithDatabase {
 protected:
  void SetUp() override {
    WithDatabase::SetUp();
    if (database) prepare();
  }

  // Has the service's events published until enough have come, and keeps the lines of the recorded
  // form as a recording.
  void publish(std::vector<std::string> form) {
    const PrivateBus bus;
    const ServiceProcess service(bus, "simulated,speed=60");
    const Subscriber subscriber(broker, folder.path() + "/received");
    const auto program = collector();
    std::vector<std::string> words = {
        "publish", broker.url(), "--bus", bus.address(), "--phone",
        "one",     "--every",    "50ms",  "--state",     folder.path() + "/state"};
    words.insert(words.end(), form.begin(), form.end());
    RunningQelctl publisher(words);
    ASSERT_TRUE(haveCome(kEvents)) << publisher.err() << program->err();
    end(publisher);
    ASSERT_TRUE(eventually([&] {
      const auto numbers = subscriber.numbers();
      return !numbers.empty() && static_cast<std::size_t>(events()) == numbers.size();
    }));
    EXPECT_EQ(database->ask("SELECT missing FROM qelwatch.streams"), "0");
    EXPECT_EQ(database->ask("SELECT count(*) FROM qelwatch.event WHERE fault IS NOT NULL"), "0");
    std::ofstream recording(recordingFile());
    for (const Received& each : subscriber.received()) {
      if (each.payload.starts_with("{\"time_ms\"")) recording << each.payload << '\n';
    }
  }

  std::string recordingFile() const { return folder.path() + "/received.jsonl"; }
};

TEST_F(CollectAgreement, isThatOfAnExportCellByCell) {
  publish({});
  const std::string exported = folder.path() + "/exported.db";
  const Outcome outcome = qelctl(
      {"export", recordingFile(), "--format", "sqlite", "--out", exported, "--keep-identities"});
  ASSERT_EQ(outcome.exitCode, 0) << outcome.err;
  std::size_t tables = 0;
  for (const FleetTable& table : fleet::fleetTables()) {
    const auto& names = table.rows().table().columns;
    std::string ours =
        "concat_ws('~', to_char(time AT TIME ZONE 'UTC',"
        " 'YYYY-MM-DD\"T\"HH24:MI:SS.MS\"Z\"')";
    std::string theirs = "time_utc";
    for (std::size_t i = 0; i < table.columns().size(); ++i) {
      const FleetColumn& column = table.columns()[i];
      ours += ", coalesce(" + ofPostgres(column) + "::text, '')";
      theirs += " || '~' || coalesce(" + ofSqlite(column, names[i + 1].name) + ", '')";
    }
    const Outcome rows = run("/usr/bin/sqlite3", {exported, "SELECT " + theirs + " FROM \"" +
                                                                table.rows().table().name + "\""});
    const auto own = database->lines("SELECT " + ours + ") FROM qelwatch." + table.name());
    std::multiset<std::string> there(own.begin(), own.end());
    std::multiset<std::string> wanted;
    std::istringstream stream(rows.out);
    for (std::string line; std::getline(stream, line);) wanted.insert(line);
    EXPECT_EQ(there, wanted) << table.name();
    tables += wanted.empty() ? 0U : 1U;
  }
  EXPECT_GT(tables, 15U);
}

TEST_F(CollectAgreement, isThatOfAReplay) {
  publish({});
  const Outcome replayed = qelctl({"replay", recordingFile()});
  ASSERT_EQ(replayed.exitCode, 0) << replayed.err;
  std::size_t compared = 0;
  for (const auto& [metric, reports] : saidBy(replayed.out)) {
    const FleetTable* table = fleet::findFleetTable(metric);
    ASSERT_NE(table, nullptr) << metric;
    const auto rows = database->lines("SELECT DISTINCT ON (number) row_to_json(r) FROM qelwatch." +
                                      table->name() + " AS r ORDER BY number");
    ASSERT_EQ(rows.size(), reports.size()) << table->name();
    for (std::size_t i = 0; i < rows.size(); ++i) {
      const Json row = Json::parse(rows[i]);
      for (const FleetColumn& column : table->columns()) {
        // The dispatcher says these before it turns them into the tables' units.
        if (column.isTime || !column.unit.empty() || !reports[i].contains(column.name)) continue;
        const Json& value = reports[i][column.name];
        if (value.is_structured() || column.type == ColumnType::bytes) continue;
        EXPECT_EQ(textOf(row[column.name]), textOf(value)) << table->name() << " " << column.name;
        ++compared;
      }
    }
  }
  EXPECT_GT(compared, 2000U);
}

TEST_F(CollectAgreement, isTheSameOfBothForms) {
  publish({"--decoded"});
  // Every report of a decoded event has rows, and what stands there is in the tables' units.
  EXPECT_EQ(database->ask("SELECT count(*) FROM qelwatch.event WHERE content IS NOT NULL AND"
                          " metric NOT IN ('trigger', 'KCellularLteRadioLinkFailure')"),
            "0");
  EXPECT_GT(database->number("SELECT count(*) FROM qelwatch.lte_nbr_eutra_cell_meas WHERE nbr_rsrp"
                             " BETWEEN -140 AND -44 AND nbr_rsrq BETWEEN -19.5 AND -2.5"),
            50);
  EXPECT_EQ(database->number("SELECT count(*) FROM qelwatch.lte_nbr_eutra_cell_meas WHERE nbr_rsrp"
                             " > -44"),
            0);
  EXPECT_GT(database->number("SELECT count(*) FROM qelwatch.lte_scell_info WHERE dl_bw = 20"), 0);
}

}  // namespace
}  // namespace qel::testing
