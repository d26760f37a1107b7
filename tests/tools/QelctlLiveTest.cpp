#include <csignal>
#include <set>

#include "tools/WithService.h"

namespace qel::testing {
namespace {

class QelctlLive : public WithService {
 protected:
  // The service has its name on the bus.
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }
};

TEST_F(QelctlLive, printsTheViewersLinesUntilItIsInterrupted) {
  for (const int signal : {SIGINT, SIGTERM}) {
    RunningQelctl live(words({"live"}));
    ASSERT_TRUE(eventually([&] { return linesOf(live.out()).size() > 100; })) << live.err();
    live.signal(signal);
    EXPECT_EQ(live.waitForEnd(), 0);
    EXPECT_EQ(live.err(), "");
    const auto lines = linesOf(live.out());
    EXPECT_EQ(lines.at(0), "pushing metric file");
    const std::set<std::string> said(lines.begin(), lines.end());
    EXPECT_TRUE(said.contains("Querying SIM files"));
    EXPECT_TRUE(said.contains("Received Valid Metric"));
    EXPECT_NE(live.out().find("Received SIM Card File Info is {"), std::string::npos);
    EXPECT_EQ(live.out().back(), '\n');
  }
}

TEST_F(QelctlLive, takesTheViewersPlaceAtTheService) {
  RunningQelctl live(words({"live"}));
  ASSERT_TRUE(eventually([&] { return linesOf(live.out()).size() > 10; }));
  const std::string told = ask({"status", "--json"}).out;
  EXPECT_NE(told.find("\"application\": 2"), std::string::npos) << told;
  EXPECT_NE(told.find("\"name\": \"qelwatch\", \"events_on\": true"), std::string::npos) << told;
}

TEST_F(QelctlLive, goesOnWhenTheServiceIsBack) {
  RunningQelctl live(words({"live"}));
  ASSERT_TRUE(eventually([&] { return linesOf(live.out()).size() > 20; }));
  service.signal(SIGTERM);
  ASSERT_EQ(service.waitForEnd(), 0);
  ASSERT_TRUE(eventually([&] { return live.hasSaid("lost, waiting for it"); }));
  const std::size_t before = linesOf(live.out()).size();
  service.start();
  ASSERT_TRUE(eventually([&] { return live.hasSaid("back"); }));
  EXPECT_TRUE(eventually([&] { return linesOf(live.out()).size() > before + 50; }));
  EXPECT_EQ(linesOf(live.err()).size(), 2U) << live.err();
  live.signal(SIGTERM);
  EXPECT_EQ(live.waitForEnd(), 0);
}

TEST_F(QelctlLive, endsQuietlyWhenNobodyReads) {
  const std::string command = std::string(QEL_QELCTL) + " live --bus '" + bus.address() + "'";
  const Outcome outcome = run("/bin/sh", {"-c", "(" + command + "; echo $? >&2) | head -n 5"});
  EXPECT_EQ(linesOf(outcome.out).size(), 5U);
  EXPECT_EQ(outcome.err, "0\n");
}

TEST_F(QelctlLive, endsQuietlyThoughNothingIsLeftToSay) {
  // Nothing ever changes on this screen, so nothing is written that could fail.
  const std::string command =
      std::string(QEL_QELCTL) + " live --bus '" + bus.address() + "' --screen 'Device Info' IMSI";
  const Outcome outcome = run("/bin/sh", {"-c", "(" + command + "; echo $? >&2) | head -n 1"});
  EXPECT_EQ(outcome.out, "Device Info IMSI\n");
  EXPECT_EQ(outcome.err, "0\n");
}

TEST_F(QelctlLive, printsATableAgainWhenItHasChanged) {
  RunningQelctl live(words({"live", "--screen", "LTE", "Serving Cell Meas"}));
  const auto tables = [&] {
    std::vector<std::string> found;
    const std::string out = live.out();
    const std::string title = "LTE Serving Cell Meas\n";
    for (std::size_t at = 0; (at = out.find(title, at)) != std::string::npos;) {
      const std::size_t next = out.find(title, at + 1);
      found.push_back(out.substr(at, next - at));
      at = next;
    }
    return found;
  };
  ASSERT_TRUE(eventually([&] { return tables().size() >= 3; })) << live.out();
  live.signal(SIGINT);
  EXPECT_EQ(live.waitForEnd(), 0);
  const auto all = tables();
  EXPECT_NE(all[0].find("Waiting for Update"), std::string::npos);
  EXPECT_NE(all[1].find("rsrp"), std::string::npos);
  EXPECT_NE(all[1], all[2]);
  EXPECT_EQ(live.out().find('\x1B'), std::string::npos);
  EXPECT_EQ(live.out().find("Metric ID"), std::string::npos);
}

TEST_F(QelctlLive, drawsATableInPlaceOnATerminal) {
  RunningQelctl live(words({"live", "--screen", "LTE", "Serving Cell Meas"}),
                     RunningQelctl::Streams::terminal);
  const std::string start = "\x1B[H\x1B[2JLTE Serving Cell Meas\r\n";
  EXPECT_TRUE(eventually([&] { return live.out().starts_with(start); })) << live.out();
  EXPECT_TRUE(eventually([&] { return live.out().find(start, 1) != std::string::npos; }));
  live.signal(SIGTERM);
  EXPECT_EQ(live.waitForEnd(), 0);
}

}  // namespace
}  // namespace qel::testing
