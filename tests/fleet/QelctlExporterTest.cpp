// qelctl exporter between the service and who asks over HTTP.
#include <algorithm>
#include <map>
#include <memory>

#include "fleet/Broker.h"
#include "fleet/HttpClient.h"
#include "fleet/PrometheusServer.h"
#include "sources/simulated/Identities.h"
#include "tools/WithService.h"

namespace qel::testing {
namespace {

class QelctlExporter : public WithService {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }

  std::vector<std::string> exporting(std::vector<std::string> more = {}) const {
    std::vector<std::string> arguments = {"exporter", "--listen", address()};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return words(std::move(arguments));
  }
  std::string address() const { return "127.0.0.1:" + std::to_string(port); }
  HttpAnswer scrape(const std::string& accept = "*/*") const {
    return get(port, "/metrics", {"Host: " + address(), "Accept: " + accept});
  }
  // By the name of a series with its labels.
  std::map<std::string, double> numbers() const {
    std::map<std::string, double> all;
    for (const std::string& line : linesOf(scrape().body)) {
      const auto space = line.rfind(' ');
      if (line.starts_with("qelwatch_")) all[line.substr(0, space)] = std::stod(line.substr(space));
    }
    return all;
  }
  static std::size_t countOf(const std::map<std::string, double>& all, const std::string& name) {
    return static_cast<std::size_t>(
        std::ranges::count_if(all, [&](const auto& each) { return each.first.starts_with(name); }));
  }

  const std::uint16_t port = freePort();
};

TEST_F(QelctlExporter, answersWithNumbersAndTheirUnits) {
  RunningQelctl exporter(exporting());
  ASSERT_TRUE(eventually([&] {
    const auto now = numbers();
    return countOf(now, "qelwatch_lte_rsrp_dbm{pci=\"") == 1 &&
           countOf(now, "qelwatch_lte_neighbour_rsrp_dbm{pci=\"") > 0 &&
           countOf(now, "qelwatch_serving_cell_info{technology=\"lte\"") == 1;
  })) << exporter.err()
      << scrape().body;
  const auto first = numbers();
  EXPECT_EQ(first.at("qelwatch_service_up"), 1);
  EXPECT_TRUE(eventually([&] { return numbers().at("qelwatch_source_running") == 1; }));
  EXPECT_GE(first.at("qelwatch_service_events_dropped_total"), 0);
  EXPECT_GE(first.at("qelwatch_service_events_undecodable_total"), 0);
  const std::string received = "qelwatch_service_events_received_total";
  EXPECT_TRUE(eventually([&] { return numbers().at(received) > first.at(received); }));
  for (const auto& [name, value] : first) {
    const bool isLevel = name.find("rsrp_dbm") != std::string::npos;
    const bool isAge = name.starts_with("qelwatch_report_age_seconds");
    EXPECT_TRUE(!isLevel || (value >= -140 && value <= -43)) << name << " " << value;
    EXPECT_TRUE(!isAge || (value >= 0 && value < 3600)) << name << " " << value;
  }
  exporter.signal(SIGTERM);
  EXPECT_EQ(exporter.waitForEnd(), 0) << exporter.err();
}

TEST_F(QelctlExporter, speaksOpenMetricsAndTheOlderForm) {
  RunningQelctl exporter(exporting());
  ASSERT_TRUE(eventually([&] { return countOf(numbers(), "qelwatch_lte_rsrp_dbm{") == 1; }))
      << exporter.err();
  const HttpAnswer open = scrape();
  EXPECT_EQ(open.code, 200);
  EXPECT_NE(open.head.find(
                "Content-Type: application/openmetrics-text; version=1.0.0; charset=utf-8\r\n"),
            std::string::npos)
      << open.head;
  EXPECT_TRUE(open.body.ends_with("\n# EOF\n"));
  EXPECT_NE(open.body.find("# TYPE qelwatch_reports counter\n"), std::string::npos);
  const HttpAnswer plain = scrape("text/plain");
  EXPECT_NE(plain.head.find("Content-Type: text/plain; version=0.0.4; charset=utf-8\r\n"),
            std::string::npos)
      << plain.head;
  const Outcome checked = run("/usr/bin/promtool", {"check", "metrics"}, plain.body);
  EXPECT_EQ(checked.exitCode, 0) << checked.out << checked.err;
  EXPECT_EQ(checked.err, "");
}

TEST_F(QelctlExporter, isReadByPrometheus) {
  RunningQelctl exporter(exporting());
  const PrometheusServer prometheus(directory, {address()});
  const std::string who = "instance=\"" + address() + "\", job=\"qelwatch\"}";
  EXPECT_TRUE(eventually([&] {
    return prometheus.ask("up") == std::vector<std::string>{"up{" + who + " => 1"} &&
           prometheus.ask("count(qelwatch_lte_rsrp_dbm)") == std::vector<std::string>{"{} => 1"};
  })) << prometheus.ask("up")[0];
  EXPECT_EQ(prometheus.ask("qelwatch_service_up"),
            std::vector<std::string>{"qelwatch_service_up{" + who + " => 1"});
  EXPECT_EQ(prometheus.ask("count(qelwatch_serving_cell_info)"),
            std::vector<std::string>{"{} => 1"});
  exporter.signal(SIGTERM);
  EXPECT_EQ(exporter.waitForEnd(), 0);
  EXPECT_TRUE(eventually([&] { return prometheus.ask("qelwatch_service_up").empty(); }))
      << "series of a target that is gone go";
}

TEST_F(QelctlExporter, answersNothingElse) {
  RunningQelctl exporter(exporting());
  ASSERT_TRUE(eventually([&] { return isListening(port); })) << exporter.err();
  const std::vector<std::string> host = {"Host: " + address()};
  EXPECT_EQ(get(port, "/", host).code, 404);
  EXPECT_EQ(get(port, "/metrics/../etc/passwd", host).code, 404);
  EXPECT_EQ(http(port, "DELETE", "/metrics", host).code, 405);
  EXPECT_EQ(http(port, "HEAD", "/metrics", host).code, 200);
  EXPECT_EQ(http(port, "HEAD", "/metrics", host).body, "");
  for (const char* other :
       {"somebody.example", "localhost.somebody.example", "127.0.0.1.example"}) {
    EXPECT_EQ(get(port, "/metrics", {std::string("Host: ") + other}).code, 403) << other;
  }
  EXPECT_EQ(get(port, "/metrics", {"Host: localhost:80"}).code, 200);
  EXPECT_NE(get(port, "/" + std::string(100'000, 'a'), host).code, 200);
}

TEST_F(QelctlExporter, tellsNobodysIdentity) {
  RunningQelctl exporter(exporting());
  const std::string told = "qelwatch_reports_total{metric=\"";
  ASSERT_TRUE(eventually([&] {
    const auto now = numbers();
    return now.contains(told + "KCellularMmCommonInfo\"}") &&
           now.contains(told + "kCellularSimCardFiles\"}") &&
           now.contains(told + "KCellularEmmContext\"}");
  })) << scrape().body;
  const std::string body = scrape().body;
  for (const auto secret :
       {sources::kImsi, sources::kImsi.substr(5), sources::kIccid, sources::kProviderName}) {
    EXPECT_EQ(body.find(secret), std::string::npos) << secret;
  }
}

TEST_F(QelctlExporter, saysNothingStale) {
  RunningQelctl exporter(exporting({"--stale", "1s"}));
  ASSERT_TRUE(eventually([&] { return countOf(numbers(), "qelwatch_lte_rsrp_dbm{") == 1; }))
      << exporter.err();
  service.signal(SIGTERM);
  service.waitForEnd();
  EXPECT_TRUE(eventually([&] {
    const auto now = numbers();
    return countOf(now, "qelwatch_lte_") == 0 && countOf(now, "qelwatch_serving_cell_info") == 0 &&
           now.at("qelwatch_service_up") == 0;
  })) << scrape().body;
  EXPECT_GT(countOf(numbers(), "qelwatch_report_age_seconds{"), 0U);
  service.start();
  EXPECT_TRUE(eventually([&] { return countOf(numbers(), "qelwatch_lte_rsrp_dbm{") == 1; }));
}

TEST_F(QelctlExporter, answersBesideClientsThatDoNotAskOrRead) {
  RunningQelctl exporter(exporting());
  ASSERT_TRUE(eventually([&] { return countOf(numbers(), "qelwatch_lte_rsrp_dbm{") == 1; }));
  std::vector<std::unique_ptr<RudeClient>> rude;
  const std::string whole = "GET /metrics HTTP/1.1\r\nHost: localhost\r\n\r\n";
  for (const std::string& said : {std::string(), std::string("GET /met"), whole}) {
    for (int i = 0; i < 8; ++i) rude.push_back(std::make_unique<RudeClient>(port, said));
  }
  EXPECT_EQ(scrape().code, 200) << "all who came before are gone by then";
  const auto before = numbers().at("qelwatch_service_events_received_total");
  EXPECT_TRUE(
      eventually([&] { return numbers().at("qelwatch_service_events_received_total") > before; }));
}

TEST_F(QelctlExporter, tellsWhenNobodyCanListen) {
  RunningQelctl first(exporting());
  ASSERT_TRUE(eventually([&] { return isListening(port); })) << first.err();
  const Outcome second = qelctl(exporting());
  EXPECT_EQ(second.exitCode, 69);
  EXPECT_EQ(second.err, "qelctl: " + address() + ": Address already in use\n");
  const Outcome nowhere = ask({"exporter", "--listen", "192.0.2.1:9817"});
  EXPECT_EQ(nowhere.exitCode, 69);
  EXPECT_EQ(nowhere.err, "qelctl: 192.0.2.1:9817: Cannot assign requested address\n");
}

TEST_F(QelctlExporter, refusesWhatIsNoAddress) {
  for (const char* listen : {"9817", "localhost:9817", "127.0.0.1:x", "127.0.0.1:99999"}) {
    const Outcome outcome = ask({"exporter", "--listen", listen});
    EXPECT_EQ(outcome.exitCode, 64) << listen;
    EXPECT_EQ(outcome.err, "qelctl: usage: --listen is ADDRESS:PORT, such as 127.0.0.1:9817\n");
  }
}

TEST_F(QelctlExporter, tellsWhenTheServiceIsNotThere) {
  const PrivateBus empty;
  const Outcome outcome = qelctl({"exporter", "--bus", empty.address(), "--listen", address()});
  EXPECT_EQ(outcome.exitCode, 69);
  EXPECT_TRUE(outcome.err.starts_with("qelctl: baseband manager service: ")) << outcome.err;
  EXPECT_EQ(linesOf(outcome.err).size(), 1U) << outcome.err;
}

TEST_F(QelctlExporter, takesAnyFreePortAndSaysWhich) {
  RunningQelctl exporter(words({"exporter", "--listen", "127.0.0.1:0"}));
  const std::string begin = "http://127.0.0.1:";
  ASSERT_TRUE(eventually([&] { return exporter.hasSaid("has the numbers"); })) << exporter.err();
  const std::string said = exporter.err();
  const auto got = std::stoul(said.substr(said.find(begin) + begin.size()));
  ASSERT_NE(got, 0U);
  EXPECT_EQ(get(static_cast<std::uint16_t>(got), "/metrics").code, 200);
}

}  // namespace
}  // namespace qel::testing
