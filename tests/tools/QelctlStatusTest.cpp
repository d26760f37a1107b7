#include <nlohmann/json.hpp>

#include "tools/WithService.h"

namespace qel::testing {
namespace {

class QelctlStatus : public WithService {
 protected:
  nlohmann::json status() const { return nlohmann::json::parse(ask({"status", "--json"}).out); }
};

TEST_F(QelctlStatus, tellsWhatTheServiceDoes) {
  Client client(bus, "tester");
  ASSERT_TRUE(client.waitForReachable(true));
  ASSERT_EQ(client.install(7, {20330, 19972}).code, 0);
  auto told = status();
  EXPECT_EQ(told["version"].get<std::string>().find_first_not_of("0123456789."), std::string::npos);
  EXPECT_NE(told["source"].get<std::string>().find("simulated"), std::string::npos);
  EXPECT_EQ(told["source_running"], false);
  EXPECT_EQ(told["configurations"], nlohmann::json::parse(R"([{"application": 7, "metrics": 2}])"));
  EXPECT_EQ(told["clients"],
            nlohmann::json::parse(
                R"([{"name": "tester", "events_on": false, "delivered": 0, "dropped": 0}])"));
  client.transport().eventsOn();
  ASSERT_TRUE(client.waitForMetrics(5));
  told = status();
  EXPECT_EQ(told["source_running"], true);
  EXPECT_EQ(told["clients"][0]["events_on"], true);
  EXPECT_GE(told["events"]["received"], 5);
  EXPECT_GE(told["events"]["delivered"], 5);
  EXPECT_EQ(told["events"]["dropped"], 0);
  EXPECT_EQ(told["events"]["undecodable"], 0);
}

TEST_F(QelctlStatus, tellsItToPeople) {
  Client client(bus, "a \x1B[31mred\x1B[0m name");
  ASSERT_TRUE(client.waitForReachable(true));
  ASSERT_EQ(client.install(7, {20330}).code, 0);
  const Outcome outcome = ask({"status"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(outcome.err, "");
  for (const char* part : {"version \"", "simulated", "application 7, 1 metrics", "events off",
                           "0 received", "0 undecodable"}) {
    EXPECT_NE(outcome.out.find(part), std::string::npos) << part << " in " << outcome.out;
  }
  // A name cannot reach the terminal as a command.
  EXPECT_EQ(outcome.out.find('\x1B'), std::string::npos);
}

// Of these only the first was escaped: a client could turn and hide what stood beside its name.
TEST_F(QelctlStatus, letsNoNameCommandTheTerminal) {
  const std::string name = "a\x1B\x7F\xC2\x9B\xD8\x9C\xE2\x80\xAE\xE2\x81\xA6z";
  Client client(bus, name);
  ASSERT_TRUE(client.waitForReachable(true));
  const std::string escaped = R"("a\u001b\u007f\u009b\u061c\u202e\u2066z")";
  EXPECT_NE(ask({"status"}).out.find("client          " + escaped), std::string::npos);
  EXPECT_NE(ask({"status", "--json"}).out.find(escaped), std::string::npos);
  EXPECT_EQ(status()["clients"][0]["name"], name);
}

TEST(QelctlStatusOfARawLog, tellsWhichPacketsCameAndWhatBecameOfThem) {
  const PrivateBus bus;
  const ServiceProcess service(bus, "diag:" QEL_RAW_LOGS "/pixel5_2023.qmdl,speed=1000");
  Client client(bus, "tester");
  ASSERT_TRUE(client.waitForReachable(true));
  ASSERT_EQ(client.install(7, {20330, 54017}).code, 0);
  client.transport().eventsOn();
  ASSERT_TRUE(client.waitForMetrics(26));
  const auto told = nlohmann::json::parse(qelctl({"status", "--json", "--bus", bus.address()}).out);
  EXPECT_EQ(told["facts"]["frames"], "19");
  EXPECT_EQ(told["facts"]["bad frames"], "0");
  EXPECT_EQ(told["facts"]["log B193 version 48"], "13 understood");
  const auto text = qelctl({"status", "--bus", bus.address()}).out;
  EXPECT_NE(text.find(R"(fact            "log B193 version 48": "13 understood")"),
            std::string::npos)
      << text;
}

// Reports without content went to every viewer and ended it.
TEST(QelctlStatusOfARecording, countsReportsThatNoTableCouldDraw) {
  const TemporaryRecording recording(metricLine(0x3C0000 + 11788, Bytes{}) +
                                     metricLine(0x3C0000 + 20330, Bytes{0x08, 0x01}) +
                                     metricLine(0x3C0000 + 19992, Bytes{}));
  const PrivateBus bus;
  const ServiceProcess service(bus, "recording:" + recording.path());
  Client client(bus, "tester");
  ASSERT_TRUE(client.waitForReachable(true));
  ASSERT_EQ(client.install(7, {11788, 20330, 19992}).code, 0);
  client.transport().eventsOn();
  ASSERT_TRUE(client.waitForMetrics(1));
  EXPECT_EQ(client.metrics().front(), 0x3C0000 + 19992);
  const std::vector<std::string> words = {"status", "--bus", bus.address()};
  EXPECT_NE(qelctl(words).out.find("0 undecodable, 2 without content"), std::string::npos);
  const auto told = nlohmann::json::parse(qelctl({"status", "--json", "--bus", bus.address()}).out);
  EXPECT_EQ(told["events"]["without_content"], 2);
  EXPECT_EQ(told["events"]["received"], 3);
}

// Once such a file was read whole, and refused, before its service was there.
TEST(QelctlStatusOfARecording, tellsWhereAndWhyItEndedEarly) {
  std::string lines;
  std::size_t count = 0;
  for (; lines.size() < 5'000'000; ++count) lines += kTriggerLine;
  const TemporaryRecording recording(lines + "no event\n");
  const PrivateBus bus;
  const ServiceProcess service(bus, "recording:" + recording.path() + ",speed=1000000");
  Client client(bus, "tester");
  ASSERT_TRUE(client.waitForReachable(true));
  ASSERT_EQ(client.install(7, {19992}).code, 0);
  client.transport().eventsOn();
  const auto told = [&bus] {
    return nlohmann::json::parse(qelctl({"status", "--json", "--bus", bus.address()}).out);
  };
  ASSERT_TRUE(eventually([&] { return told()["condition"]["state"] == "ended"; }));
  const auto status = told();
  EXPECT_EQ(status["condition"]["reason"],
            "line " + std::to_string(count + 1) + ": not JSON, column 2");
  EXPECT_EQ(status["events"]["received"], count);
}

// A modem that cannot give values once looked like one with nothing to report.
TEST(QelctlStatusOfAModem, tellsHowItIsWithIt) {
  const PrivateBus bus;
  const ServiceProcess service(bus, "modem-manager,bus=" + bus.address());
  Client client(bus, "tester");
  ASSERT_TRUE(client.waitForReachable(true));
  const auto status = [&bus](const char* form) {
    return qelctl({"status", "--bus", bus.address(), form}).out;
  };
  EXPECT_TRUE(nlohmann::json::parse(status("--json"))["condition"].is_null());
  client.transport().eventsOn();
  ASSERT_TRUE(
      eventually([&] { return !nlohmann::json::parse(status("--json"))["condition"].is_null(); }));
  EXPECT_EQ(nlohmann::json::parse(status("--json"))["condition"],
            nlohmann::json::parse(
                R"({"state": "no-modem-manager", "text": "ModemManager not running"})"));
  const std::string shown = qelctl({"status", "--bus", bus.address()}).out;
  EXPECT_NE(shown.find("condition       \"ModemManager not running\"\n"), std::string::npos)
      << shown;
}

void expectAbsent(const std::vector<std::string>& words, const std::string& why) {
  const Outcome outcome = qelctl(words);
  EXPECT_EQ(outcome.exitCode, 69) << words.front();
  EXPECT_EQ(outcome.out, "");
  EXPECT_EQ(outcome.err, "qelctl: baseband manager service: " + why + "\n");
}

TEST(QelctlWithoutService, saysThatItIsNotThere) {
  const PrivateBus bus;
  const std::string file = ::testing::TempDir() + std::to_string(::getpid()) + "_absent.jsonl";
  expectAbsent({"status", "--bus", bus.address()}, "not reachable");
  expectAbsent({"status", "--bus", bus.address(), "--json"}, "not reachable");
  expectAbsent({"live", "--bus", bus.address()}, "not reachable");
  expectAbsent({"live", "--bus", bus.address(), "--screen", "LTE", "NAS"}, "not reachable");
  expectAbsent({"record", file, "--bus", bus.address()}, "not reachable");
  EXPECT_FALSE(std::filesystem::exists(file));
}

TEST(QelctlWithoutService, saysThatThereIsNoBus) {
  for (const char* command : {"status", "live"}) {
    expectAbsent({command, "--bus", "unix:path=/nonexistent"}, "no message bus");
  }
  expectAbsent({"status", "--bus", "nonsense"}, "no message bus");
}

TEST(QelctlWithoutService, saysThatThePermissionIsMissing) {
  const PrivateBus bus(
      "<policy context=\"default\"><allow user=\"*\"/><allow own=\"*\"/>"
      "<allow send_destination=\"*\"/><allow receive_sender=\"*\"/>"
      "<deny send_destination=\"tesk.BasebandManager1\"/></policy>");
  const ServiceProcess service(bus, "simulated");
  EXPECT_TRUE(eventually([&] {
    return qelctl({"status", "--bus", bus.address()}).err ==
           "qelctl: baseband manager service: no permission to use it (is the user in group "
           "baseband?)\n";
  }));
}

TEST(QelctlWithoutService, findsOneThatStartsMeanwhile) {
  const PrivateBus bus;
  RunningQelctl live({"live", "--bus", bus.address()});
  const ServiceProcess service(bus, "simulated,speed=20");
  EXPECT_TRUE(eventually([&] { return linesOf(live.out()).size() > 20; })) << live.err();
}

}  // namespace
}  // namespace qel::testing
