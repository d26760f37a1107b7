// What phones send stands in the tables, each event once.
#include <thread>

#include "fleet/WireTap.h"
#include "fleet/collect/WithDatabase.h"

namespace qel::testing {
namespace {

class Collect : public WithDatabase {
 protected:
  void SetUp() override {
    WithDatabase::SetUp();
    if (database) prepare();
  }
};

TEST_F(Collect, storesBothFormsOfAnEvent) {
  const auto program = collector();
  send(kRrcTopic, rrcState(1));
  send("qelwatch/lab/KCellularLteNbrEutraCellMeas",
       R"({"time_ms": 1700000000005, "event": "metric", "metric": "KCellularLteNbrEutraCellMeas", )"
       R"("record": {"timestamp": 1700000000004, "meas_nbr_eutra": [{"nbr_rsrp": -90, "nbr_rsrq": )"
       R"(-10.5}, {"nbr_rsrp": -91}]}, "units": {}, "stream": 7, "number": 2})"
       "\n");
  ASSERT_TRUE(haveCome(2)) << program->err();
  EXPECT_EQ(database->ask("SELECT phone, stream, number, timestamp, state, prev_state_dur_ms,"
                          " prev_state IS NULL FROM qelwatch.lte_rrc_state"),
            "lab|7|1|1970-01-01 00:00:01+00|KLTE_RRC_STATE_CONNECTED|250|t");
  EXPECT_EQ(database->ask("SELECT number, timestamp, list, entry, nbr_rsrp, nbr_rsrq"
                          " FROM qelwatch.lte_nbr_eutra_cell_meas ORDER BY entry"),
            "2|2023-11-14 22:13:20.004+00|meas_nbr_eutra|0|-90|-10.5\n"
            "2|2023-11-14 22:13:20.004+00|meas_nbr_eutra|1|-91|");
  EXPECT_TRUE(end(*program).ends_with(": 2 events stored\n")) << program->err();
}

TEST_F(Collect, takesNothingTwice) {
  std::string lines;
  for (int number = 1; number <= 50; ++number) lines += rrcState(number);
  const auto program = collector();
  send(kRrcTopic, lines + lines);
  ASSERT_TRUE(haveCome(50)) << program->err();
  send(kRrcTopic, lines + rrcState(51));
  ASSERT_TRUE(haveCome(51));
  EXPECT_TRUE(end(*program).ends_with(": 51 events stored, 100 came again\n")) << program->err();
  EXPECT_EQ(events(), 51);
  EXPECT_EQ(database->ask("SELECT count(*), count(DISTINCT number) FROM qelwatch.lte_rrc_state"),
            "51|51");
}

TEST_F(Collect, keepsWhatBelongsToNoTable) {
  const auto program = collector();
  send("qelwatch/lab/trigger",
       "{\"time_ms\": 5, \"event\": \"trigger\", \"kKeyTriggerID\": 8323091, \"stream\": 7,"
       " \"number\": 1}\n");
  send("qelwatch/lab/KCellularLteRadioLinkFailure",
       "{\"time_ms\": 6, \"event\": \"metric\", \"kKeyMetricID\": 3952165, \"kKeyPayload\": "
       "\"CAE=\", \"stream\": 7, \"number\": 2}\n");
  send(kRrcTopic,
       "{\"time_ms\": 7, \"event\": \"metric\", \"kKeyMetricID\": 3952132, \"kKeyPayload\": "
       "\"CA==\", \"stream\": 7, \"number\": 3}\n");
  ASSERT_TRUE(haveCome(3)) << program->err();
  EXPECT_EQ(database->ask("SELECT number, metric, fault, content FROM qelwatch.event ORDER BY 1"),
            "1|trigger||{\"kKeyTriggerID\": 8323091}\n"
            "2|KCellularLteRadioLinkFailure||{\"kKeyPayload\": \"<0801>\", \"kKeyMetricID\": "
            "3952165}\n"
            "3|KCellularLteRrcState|payload cannot be decoded|");
}

TEST_F(Collect, holdsNothingUpForBrokenMessages) {
  const auto program = collector();
  send("qelwatch/lab/x", "not JSON\n{}\n[1]\n");
  send("qelwatch/352099001761481/x", rrcState(1));
  send(kRrcTopic, "{\"time_ms\": 1, \"event\": \"metric\", \"kKeyMetricID\": 3952132}\n");
  send(kRrcTopic,
       "{\"time_ms\": 1, \"event\": \"metric\", \"kKeyMetricID\": 3952132, \"stream\": "
       "7, \"number\": 18446744073709551615}\n");
  send("qelwatch/lab/status", "perhaps\n");
  send("qelwatch/lab/queue", "{\"stream\": 7}\n");
  const std::string large(1'100'000, 'x');
  send(kRrcTopic, "{\"time_ms\": 1, \"x\": \"" + large + "\"}\n");
  send(kRrcTopic, rrcState(1));
  ASSERT_TRUE(haveCome(1)) << program->err();
  const std::string said = end(*program);
  EXPECT_TRUE(said.ends_with(": 1 events stored, 9 messages of no phone\n")) << said;
  std::size_t lines = 0;
  for (const char c : said) lines += c == '\n' ? 1U : 0U;
  EXPECT_LE(lines, 3U) << said;
  EXPECT_NE(said.find(" none of a phone, "), std::string::npos) << said;
}

TEST_F(Collect, takesWhatADatabaseCannotHoldAlone) {
  const auto program = collector();
  // The database has no place for this character in JSON.
  std::string lines = rrcState(1) + rrcState(2);
  lines += R"({"time_ms": 5, "event": "trigger", "kKeyTriggerID": 1, "x": "a\u0000b", )"
           R"("stream": 7, "number": 3})"
           "\n";
  lines += rrcState(4);
  send(kRrcTopic, lines);
  ASSERT_TRUE(haveCome(4)) << program->err();
  EXPECT_EQ(database->ask("SELECT number, fault FROM qelwatch.event WHERE fault IS NOT NULL"),
            "3|the database does not take its content");
  EXPECT_EQ(database->ask("SELECT count(*) FROM qelwatch.lte_rrc_state"), "3");
}

TEST_F(Collect, knowsWhoIsThereAndWhatWillNeverCome) {
  const auto program = collector();
  send("qelwatch/lab/status", "online\noffline\n");
  send("qelwatch/lab/queue", "{\"stream\": 7, \"dropped\": 1, \"lost\": 1, \"undecodable\": 0}\n");
  send(kRrcTopic, rrcState(1) + rrcState(4));
  ASSERT_TRUE(haveCome(2)) << program->err();
  ASSERT_TRUE(
      eventually([&] { return database->ask("SELECT count(*) FROM qelwatch.queue") == "1"; }));
  EXPECT_EQ(database->ask("SELECT phone, events, newest, missing, dropped, lost"
                          " FROM qelwatch.streams"),
            "lab|2|4|2|1|1");
  EXPECT_EQ(database->ask("SELECT phone, last_event IS NULL, status FROM qelwatch.phones"),
            "lab|t|offline");
}

TEST_F(Collect, knowsWhatTheBrokerDoesNotTakeInWhateverOrderItHears) {
  const auto program = collector();
  send("qelwatch/lab/queue",
       "{\"stream\": 7, \"dropped\": 0, \"lost\": 0, \"too_large\": 2, \"undecodable\": 0}\n"
       "{\"stream\": 7, \"dropped\": 0, \"lost\": 0, \"too_large\": 1, \"undecodable\": 0}\n");
  send(kRrcTopic, rrcState(3));
  ASSERT_TRUE(haveCome(1)) << program->err();
  EXPECT_TRUE(eventually([&] {
    return database->ask("SELECT phone, missing, dropped, lost, too_large FROM qelwatch.streams") ==
           "lab|2|0|0|2";
  })) << database->ask("SELECT * FROM qelwatch.streams");
}

TEST_F(Collect, knowsTheLastOfWhatIsSaidAtOnce) {
  const auto program = collector();
  std::string said;
  for (int i = 0; i < 20; ++i) said += "online\noffline\n";
  send("qelwatch/lab/status", said + "online\n");
  send(kRrcTopic, rrcState(1));
  ASSERT_TRUE(eventually([&] {
    return database->number("SELECT count(*) FROM qelwatch.status") == 41;
  })) << program->err();
  EXPECT_EQ(database->number("SELECT count(DISTINCT time) FROM qelwatch.status"), 41);
  EXPECT_EQ(database->ask("SELECT status FROM qelwatch.phones"), "online");
}

TEST_F(Collect, acknowledgesNothingBeforeItIsCommitted) {
  const WireTap tap(broker.port());
  RunningQelctl program({"collect", "mqtt://127.0.0.1:" + std::to_string(tap.port()), "--database",
                         database->address(), "--every", "20ms", "--name", "one"});
  ASSERT_TRUE(eventually([&] { return program.hasSaid("connected as one"); })) << program.err();
  send(kRrcTopic, rrcState(1));
  ASSERT_TRUE(haveCome(1));
  const std::string acknowledgement("\x40\x02\x00", 3);  // the first message has number 1
  ASSERT_TRUE(
      eventually([&] { return tap.sent().find(acknowledgement + '\x01') != std::string::npos; }));
  // Somebody holds the table: a batch has to wait in the middle of its transaction.
  std::thread holder([this] {
    database->ask("BEGIN; LOCK TABLE qelwatch.lte_rrc_state; SELECT pg_sleep(3); COMMIT");
  });
  ASSERT_TRUE(eventually([&] {
    return database->number(
               "SELECT count(*) FROM pg_locks WHERE mode = 'AccessExclusiveLock' AND"
               " relation = 'qelwatch.lte_rrc_state'::regclass") > 0;
  }));
  const std::size_t before = tap.sent().size();
  send(kRrcTopic, rrcState(2) + rrcState(3));
  ASSERT_TRUE(eventually([&] {
    return database->number(
               "SELECT count(*) FROM pg_stat_activity WHERE wait_event_type = 'Lock'"
               " AND application_name = 'qelctl collect'") > 0;
  }));
  EXPECT_EQ(tap.sent().size(), before);
  holder.join();
  ASSERT_TRUE(haveCome(3));
  EXPECT_TRUE(eventually([&] { return tap.sent().size() > before; }));
}

TEST_F(Collect, sharesTheLoadWithOthers) {
  auto first = collector("first");
  auto second = collector("second");
  std::string lines;
  for (int number = 1; number <= 400; ++number) lines += rrcState(number);
  send(kRrcTopic, lines);
  ASSERT_TRUE(haveCome(400)) << first->err() << second->err();
  const auto share = [](const std::string& said) {
    const auto at = said.find(" events stored");
    return std::stol(said.substr(said.rfind(' ', at - 1) + 1));
  };
  const long one = share(end(*first));
  const long other = share(end(*second));
  EXPECT_EQ(one + other, 400);
  EXPECT_GT(one, 50);
  EXPECT_GT(other, 50);
}

TEST_F(Collect, makesDaysAsTheyCome) {
  const auto program = collector();
  const long now = 1000 * database->number("SELECT extract(epoch FROM now())::bigint");
  send(kRrcTopic, rrcState(1, now) + rrcState(2, now - 5L * 86'400'000) + rrcState(3, 0) +
                      rrcState(4, now + 400L * 86'400'000));
  ASSERT_TRUE(haveCome(4)) << program->err();
  EXPECT_EQ(
      database->ask("SELECT string_agg(CASE WHEN tableoid = 'qelwatch.event_default'::regclass"
                    " THEN 'default' ELSE 'day' END, ' ' ORDER BY number) FROM"
                    " qelwatch.event"),
      "day day default default");
}

TEST_F(Collect, movesWhatWasEarlyToItsDay) {
  database->ask(
      "INSERT INTO qelwatch.event (phone, stream, number, time, metric) VALUES"
      " ('lab', 7, 1, now() + interval '2 days', 'trigger')");
  EXPECT_EQ(database->ask("SELECT tableoid::regclass FROM qelwatch.event"),
            "qelwatch.event_default");
  database->ask("SELECT qelwatch.make_day((now() AT TIME ZONE 'UTC')::date + 2)");
  EXPECT_NE(database->ask("SELECT tableoid::regclass FROM qelwatch.event"),
            "qelwatch.event_default");
  EXPECT_EQ(events(), 1);
}

}  // namespace
}  // namespace qel::testing
