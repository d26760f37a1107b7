// Every question that the dashboards ask of PostgreSQL, asked of tables that a collector has
// filled.
#include <ctime>
#include <map>
#include <set>

#include "fleet/Dashboards.h"
#include "fleet/KnownFleet.h"
#include "fleet/collect/WithDatabase.h"

namespace qel::testing {
namespace {

using Lines = std::vector<std::string>;

// In the places of "+61" stands the time so many seconds after the beginning, of "@61" the same as
// a number, of "SAID" when the database heard of the newest queue.
const std::map<std::string, Lines> kKnownRows = {
    {"fleet: Levels by cell A",
     {"1218|218|1300|1|1|-100.0|-100|-10.0", "1217|217|1300|2|3|-97.3|-110|-10.0"}},
    {"fleet: Cell changes an hour A", {"@0|1|1"}},
    {"fleet: Rejects by cause A", {"EMM|EMM_CAUSE_PLMN_NOT_ALLOWED|2|2|+300"}},
    {"fleet: Phones silent A", {"b|+182||", "a|+301|online|STATUS"}},
    {"fleet: Phones that report A", {"@0|2", "@7200|1"}},
    {"fleet: Handovers from cell to cell A", {"1217|1218|1|1"}},
    {"fleet: Events that will never come A", {"b|7|3|1|4|2|SAID"}},
    {"phone-postgresql: $phone", {"a", "b", "c"}},
    {"phone-postgresql: Level A", {"@60|-90", "@120|-92", "@240|-100"}},
    {"phone-postgresql: Quality A",
     {"@60|-10|12.5000000000000000", "@120|-10|12.5000000000000000",
      "@240|-10|12.5000000000000000"}},
    {"phone-postgresql: Neighbours A", {"34|1300|2|-94.5|-90|+122"}},
    {"phone-postgresql: Cells A", {"+180|217|1300|218|1300|1218|handover"}},
    {"phone-postgresql: Connections A",
     {"+1|KLTE_RRC_STATE_CONNECTED|KLTE_RRC_CAUSE_EST_MO_DATA|KLTE_RRC_STATE_IDLE|320"}},
    {"phone-postgresql: Rejects A", {"+300|EMM|EMM_CAUSE_PLMN_NOT_ALLOWED"}},
    {"phone-postgresql: Reports A",
     {"@0|KCellularEmmContext|1", "@0|KCellularLteRrcState|1", "@0|KCellularLteScellInfo|1",
      "@60|KCellularRsrpRsrqSinr|1", "@120|KCellularLteNbrEutraCellMeas|2",
      "@120|KCellularRsrpRsrqSinr|1", "@180|KCellularLteScellInfo|1",
      "@240|KCellularRsrpRsrqSinr|1", "@300|KCellularEmmContext|2"}},
};

class DashboardEvents : public WithDatabase {
 protected:
  void SetUp() override {
    WithDatabase::SetUp();
    if (IsSkipped()) return;
    prepare();
    const auto program = collector();
    for (const PhoneMessages& message : knownFleet(kStart, kStart + 7200)) {
      send(message.topic, message.lines);
    }
    ASSERT_TRUE(haveCome(kKnownEvents)) << events();
    ASSERT_TRUE(eventually(
        [this] { return database->number("SELECT count(*) FROM qelwatch.queue") == 3; }));
    end(*program);
  }

  // By who may only read.
  Lines asked(const std::string& sql) const {
    return database->lines("SET ROLE qelwatch_reader; " + sql);
  }

  Lines known(const std::string& place) const {
    Lines lines = kKnownRows.at(place);
    for (std::string& line : lines) {
      std::string row;
      for (std::size_t from = 0; from <= line.size();) {
        const auto end = std::min(line.find('|', from), line.size());
        row += (from == 0 ? "" : "|") + cell(line.substr(from, end - from));
        from = end + 1;
      }
      line = row;
    }
    return lines;
  }

  std::string cell(const std::string& text) const {
    if (text == "SAID") {
      return database->ask("SELECT max(time) FROM qelwatch.queue WHERE phone = 'b'");
    }
    if (text == "STATUS") return database->ask("SELECT max(time) FROM qelwatch.status");
    if (text.starts_with('@')) return std::to_string(kStart + std::stol(text.substr(1)));
    if (!text.starts_with('+')) return text;
    return database->ask("SELECT to_timestamp(" + std::to_string(kStart) + ") + interval '" +
                         text.substr(1) + " s'");
  }

  // The beginning of the last hour but one.
  const std::int64_t kStart = std::time(nullptr) / 3600 * 3600 - 7200;
};

TEST_F(DashboardEvents, tellOfAKnownFleetWhatItWas) {
  std::set<std::string> places;
  for (const DashboardQuery& query : dashboardQueries()) {
    if (query.source != "qelwatch-postgresql") continue;
    ASSERT_TRUE(kKnownRows.contains(query.place)) << "nobody knows the answer of " << query.place;
    const std::string sql = GrafanaValues(kStart, kStart + 7200)
                                .with("phone", "a")
                                .with("silent", "1 hour")
                                .filled(query.text);
    EXPECT_EQ(asked(sql), known(query.place)) << query.place << ": " << sql;
    places.insert(query.place);
  }
  EXPECT_EQ(places.size(), kKnownRows.size());
}

TEST_F(DashboardEvents, tellNothingOfAPhoneThatIsNotThereWhateverItsName) {
  for (const DashboardQuery& query : dashboardQueries()) {
    if (!query.place.starts_with("phone-postgresql") || query.place.ends_with("$phone")) continue;
    const std::string sql =
        GrafanaValues(kStart, kStart + 7200).with("phone", "x' OR 'a' = 'a").filled(query.text);
    EXPECT_EQ(asked(sql), Lines()) << query.place;
  }
}

}  // namespace
}  // namespace qel::testing
