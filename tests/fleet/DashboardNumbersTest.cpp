// Every question that the dashboards ask of Prometheus, asked of Prometheus.
#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <set>

#include "fleet/Dashboards.h"
#include "fleet/Folder.h"
#include "fleet/KnownDrive.h"
#include "fleet/PrometheusServer.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {
namespace {

using Lines = std::vector<std::string>;

struct KnownAnswer {
  int minute;  // of the drive
  Lines lines;
};

constexpr int kOnLte = 39;
constexpr int kOnUmts = 49;
constexpr int kAtTheEnd = 60;

const std::map<std::string, KnownAnswer> kKnownAnswers = {
    {"$instance", {kAtTheEnd, {R"({instance="phone:9817"} => 1)"}}},
    {"Serving cell A",
     {kOnLte,
      {R"(qelwatch_serving_cell_info{cell="1219", earfcn="1300", WHO, pci="219", technology="lte"} => 1)"}}},
    {"Level A", {kOnLte, {R"(qelwatch_lte_rsrp_dbm{earfcn="1300", WHO, pci="219"} => -100)"}}},
    {"Level B", {kOnUmts, {R"(qelwatch_umts_rscp_dbm{WHO, psc="104", uarfcn="10713"} => -75)"}}},
    {"Level C", {kAtTheEnd, {R"(qelwatch_gsm_rxlev_dbm{arfcn="12", bsic="16", WHO} => -62)"}}},
    {"Quality A", {kOnLte, {R"(qelwatch_lte_rsrq_db{earfcn="1300", WHO, pci="219"} => -10)"}}},
    {"Quality B", {kOnLte, {R"(qelwatch_lte_sinr_db{earfcn="1300", WHO, pci="219"} => 12)"}}},
    {"Quality C", {kOnUmts, {R"(qelwatch_umts_ecno_db{WHO, psc="104", uarfcn="10713"} => -7.5)"}}},
    {"Strongest neighbours A",
     {kOnLte,
      {R"(qelwatch_lte_neighbour_rsrp_dbm{earfcn="1300", WHO, pci="34"} => -90)",
       R"(qelwatch_lte_neighbour_rsrp_dbm{earfcn="1300", WHO, pci="35"} => -91)",
       R"(qelwatch_lte_neighbour_rsrp_dbm{earfcn="1300", WHO, pci="36"} => -92)",
       R"(qelwatch_lte_neighbour_rsrp_dbm{earfcn="1300", WHO, pci="37"} => -93)",
       R"(qelwatch_lte_neighbour_rsrp_dbm{earfcn="1300", WHO, pci="38"} => -94)"}}},
    {"Cell changes an hour A",
     {kAtTheEnd, {R"({WHO, kind="handover"} => 1)", R"({WHO, kind="reselection"} => 1)"}}},
    {"Rejects and failures an hour A",
     {kAtTheEnd, {R"({WHO, kind="radio-link-failure"} => 0)", R"({WHO, kind="reject"} => 1)"}}},
    {"Reports a minute A",
     {kOnLte,
      {R"({WHO, metric="KCellularEmmContext"} => 0)",
       R"({WHO, metric="KCellularLteNbrEutraCellMeas"} => 4)",
       R"({WHO, metric="KCellularLteRrcState"} => 0)",
       R"({WHO, metric="KCellularLteScellInfo"} => 0)",
       R"({WHO, metric="KCellularLteServingCellMeasurement"} => 4)"}}},
    {"Newest report A", {kAtTheEnd, {"{} => 1"}}},
    {"Service A", {kAtTheEnd, {"qelwatch_service_up{WHO} => 1"}}},
    {"Events not taken an hour A", {kAtTheEnd, {"{WHO} => 240"}}},
    {"Events not taken an hour B", {kAtTheEnd, {"{WHO} => 480"}}},
    {"Events not taken an hour C", {kAtTheEnd, {"{WHO} => 1"}}},
};

// With six digits, for what divides by seconds and multiplies by them again.
std::string rounded(const std::string& line) {
  static const std::string kArrow = " => ";
  const auto at = line.rfind(kArrow);
  if (at == std::string::npos) return line;
  std::array<char, 32> value{};
  std::snprintf(value.data(), value.size(), "%.6g", std::stod(line.substr(at + kArrow.size())));
  return line.substr(0, at + kArrow.size()) + value.data();
}

std::string withWho(std::string line) {
  const std::string mark = "WHO";
  const auto at = line.find(mark);
  if (at == std::string::npos) return line;
  return line.replace(at, mark.size(),
                      std::string("instance=\"") + kDrivenPhone + "\", job=\"qelwatch\"");
}

// label_values(METRIC, LABEL) is a question that Grafana puts in other words.
std::string inPromql(const std::string& query) {
  static const std::string kBegin = "label_values(";
  if (!query.starts_with(kBegin)) return query;
  const auto comma = query.find(", ");
  const std::string metric = query.substr(kBegin.size(), comma - kBegin.size());
  return "group by (" + query.substr(comma + 2, query.size() - comma - 3) + ") (" + metric + ")";
}

TEST(Dashboards, tellOfAKnownDriveWhatItWas) {
  const Folder folder;
  keepForPrometheus(knownDrive(), folder.path());
  const PrometheusServer prometheus(folder.path());
  const std::string begin = "phone-prometheus: ";
  std::set<std::string> asked;
  for (const DashboardQuery& query : dashboardQueries()) {
    if (query.source != "qelwatch-prometheus") continue;
    ASSERT_TRUE(query.place.starts_with(begin)) << query.place;
    const std::string place = query.place.substr(begin.size());
    ASSERT_TRUE(kKnownAnswers.contains(place)) << "nobody knows the answer of " << place;
    const KnownAnswer& known = kKnownAnswers.at(place);
    const std::int64_t timeS = kDriveStartS + known.minute * 60 + 1;
    const GrafanaValues values = GrafanaValues(kDriveStartS, timeS).with("instance", kDrivenPhone);
    Lines lines;
    for (const auto& line : prometheus.ask(inPromql(values.filled(query.text)), timeS)) {
      lines.push_back(rounded(line));
    }
    Lines wanted;
    for (const std::string& line : known.lines) wanted.push_back(withWho(line));
    EXPECT_EQ(lines, wanted) << place << ": " << query.text;
    asked.insert(place);
  }
  EXPECT_EQ(asked.size(), kKnownAnswers.size());
}

TEST(Dashboards, areAsGrafanaReadsThem) {
  const std::set<std::string> sources = {"qelwatch-prometheus", "qelwatch-postgresql"};
  std::set<std::string> names;
  for (const auto& [name, dashboard] : dashboards()) {
    EXPECT_TRUE(names.insert(dashboard.at("uid")).second) << name;
    EXPECT_TRUE(names.insert(dashboard.at("title")).second) << name;
    EXPECT_EQ(dashboard.at("schemaVersion"), 37);
    std::set<int> numbers;
    std::set<std::pair<int, int>> places;
    for (const auto& panel : dashboard.at("panels")) {
      EXPECT_TRUE(numbers.insert(panel.at("id").get<int>()).second) << name;
      EXPECT_TRUE(sources.contains(panel.at("datasource").at("uid"))) << name;
      EXPECT_FALSE(panel.at("targets").empty()) << name << panel.at("title");
      const auto number = [&](const char* key) { return panel.at("gridPos").at(key).get<int>(); };
      for (int x = number("x"); x < number("x") + number("w"); ++x) {
        EXPECT_LT(x, 24);
        for (int y = number("y"); y < number("y") + number("h"); ++y) {
          EXPECT_TRUE(places.emplace(x, y).second) << name << " has two panels in one place";
        }
      }
    }
  }
  EXPECT_EQ(dashboards().size(), 3U);
}

}  // namespace
}  // namespace qel::testing
