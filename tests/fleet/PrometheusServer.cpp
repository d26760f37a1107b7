#include "fleet/PrometheusServer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>

#include "fleet/Broker.h"
#include "fleet/HttpClient.h"
#include "support/Subprocess.h"
#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {
namespace {

constexpr const char* kPromtool = "/usr/bin/promtool";

std::string configurationFor(const std::vector<std::string>& targets) {
  std::string text = "global: {scrape_interval: 250ms}\nscrape_configs:\n";
  if (targets.empty()) return text + "  []\n";
  text += "  - job_name: qelwatch\n    static_configs: [{targets: [";
  for (const std::string& target : targets) text += "'" + target + "',";
  return text + "]}]\n";
}

}  // namespace

PrometheusServer::PrometheusServer(const std::string& directory,
                                   const std::vector<std::string>& targets)
    : _port(freePort()) {
  const std::string configuration = directory + "/prometheus.yml";
  std::ofstream(configuration) << configurationFor(targets);
  _process = std::make_unique<ChildProcess>(Launch{
      .words = {"/usr/bin/prometheus", "--config.file=" + configuration,
                "--storage.tsdb.path=" + directory + "/data", "--storage.tsdb.retention.time=100y",
                "--web.listen-address=" + address(), "--log.level=warn"},
      .err = directory + "/prometheus.log"});
  EXPECT_TRUE(eventually([&] {
    return get(_port, "/-/ready", {"Host: localhost", "Connection: close"}).code == 200;
  }));
}

std::vector<std::string> PrometheusServer::ask(const std::string& query, std::int64_t timeS) const {
  std::vector<std::string> words = {"query", "instant"};
  if (timeS != 0) words.push_back("--time=" + std::to_string(timeS));
  words.insert(words.end(), {"http://" + address(), query});
  const Outcome outcome = run(kPromtool, words);
  if (outcome.exitCode != 0) return {"fault: " + outcome.err};
  std::vector<std::string> lines = linesOf(outcome.out);
  std::erase(lines, "");  // that is how promtool says that there is nothing
  for (std::string& line : lines) line.resize(std::min(line.size(), line.rfind(" @[")));
  std::ranges::sort(lines);
  return lines;
}

void keepForPrometheus(const std::string& openMetrics, const std::string& directory) {
  std::ofstream(directory + "/told.txt") << openMetrics;
  const Outcome outcome = run(kPromtool, {"tsdb", "create-blocks-from", "openmetrics",
                                          directory + "/told.txt", directory + "/data"});
  EXPECT_EQ(outcome.exitCode, 0) << outcome.out << outcome.err;
}

}  // namespace qel::testing
