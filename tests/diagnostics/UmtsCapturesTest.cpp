// What is known to be in raw logs of real modems comes out for UMTS's cell, signal and neighbours,
// and nothing else does but what the logs of gain control say. Skipped without the logs.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <map>

#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/wcdma.h"
#include "sources/Metrics.h"
#include "support/diagnostics/CaptureRun.h"

namespace qel::diagnostics {
namespace {

using nlohmann::json;
using test::ToldMetric;

json cell(const ToldMetric& told) {
  const auto message = KCellularWcdmaCellInfo::initWithData(told.payload);
  return {{{"mcc", message->mcc()},
           {"mnc", message->mnc()},
           {"num_mnc_digits", message->numMncDigits()},
           {"lac", message->lac()},
           {"cell_id", message->cellId()},
           {"dl_uarfcn", message->dlUarfcn()},
           {"psc", message->psc()}}};
}

json signal(const ToldMetric& told) {
  const auto message = KCellularWcdmaScellMeasurement::initWithData(told.payload);
  json receivers = json::array();
  for (const auto& receiver : message->rxInfos())
    receivers.push_back({{"rx", receivers.size()}, {"rssi", receiver->rssi()}});
  return {{{"rx_info", receivers}}};
}

json neighbours(const ToldMetric& told) {
  const auto message = KCellularWcdmaNbrCellMeas::initWithData(told.payload);
  json cells = json::array();
  for (const auto& one : message->measUtraResults()) {
    cells.push_back({{"uarfcn", one->uarfcn()},
                     {"psc", one->psc()},
                     {"rscp", one->rscp()},
                     {"ecno", one->ecno()}});
  }
  return cells;
}

const std::map<std::uint32_t, json (*)(const ToldMetric&)> kEntries = {
    {metric::kUmtsCellInfo, cell},
    {metric::kUmtsServingMeasurement, signal},
    {metric::kUmtsNeighbours, neighbours},
};

// Levels may be rounded the other way.
bool alike(const json& found, const json& wanted, const std::string& name = {}) {
  if (found.is_number() && wanted.is_number()) {
    const bool level = name == "rssi" || name == "rscp" || name == "ecno";
    return std::abs(found.get<int>() - wanted.get<int>()) <= (level ? 1 : 0);
  }
  if (found.size() != wanted.size() || found.type() != wanted.type()) return false;
  if (found.is_array())
    return std::equal(found.begin(), found.end(), wanted.begin(),
                      [](const json& one, const json& other) { return alike(one, other); });
  return std::ranges::all_of(found.items(), [&](const auto& item) {
    return wanted.contains(item.key()) && alike(item.value(), wanted[item.key()], item.key());
  });
}

struct Counts {
  int facts = 0, soft = 0, softFound = 0, told = 0, furtherSignals = 0;
};

bool isFact(const ToldMetric& told, const json& entry, const std::vector<json>& facts) {
  return std::ranges::any_of(facts, [&](const json& fact) {
    return fact["n"] == told.number && fact["metric"] == told.metric && alike(entry, fact["key"]);
  });
}

// Nothing is told that is not a fact.
std::map<std::uint32_t, Counts> judgeTold(const std::vector<ToldMetric>& all,
                                          const std::vector<json>& facts) {
  std::map<std::uint32_t, Counts> counts;
  for (const ToldMetric& told : all) {
    const auto entries = kEntries.find(told.metric);
    if (entries == kEntries.end()) continue;
    for (const json& entry : entries->second(told)) {
      ++counts[told.metric].told;
      if (isFact(told, entry, facts)) continue;
      // Of gain control the facts say nothing.
      const bool ofGainControl = told.metric == metric::kUmtsServingMeasurement;
      EXPECT_TRUE(ofGainControl) << told.number << ' ' << told.metric << ' ' << entry;
      ++counts[told.metric].furtherSignals;
    }
  }
  return counts;
}

bool isTold(const json& fact, const std::vector<ToldMetric>& all) {
  return std::ranges::any_of(all, [&](const ToldMetric& told) {
    if (fact["n"] != told.number || fact["metric"] != told.metric) return false;
    return std::ranges::any_of(kEntries.at(told.metric)(told),
                               [&](const json& entry) { return alike(entry, fact["key"]); });
  });
}

TEST(UmtsCaptures, TellWhatIsKnownToBeInThemAndNothingElse) {
  const auto names = test::captureNames();
  if (names.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no captures";
  for (const std::string& name : names) {
    SCOPED_TRACE(name);
    const auto all = test::readCapture(name);
    const auto facts = test::factsOf(name);
    auto counts = judgeTold(all, facts);
    for (const json& fact : facts) {
      if (!kEntries.contains(fact["metric"])) continue;
      Counts& count = counts[fact["metric"]];
      const bool soft = fact.value("soft", false);
      const bool found = isTold(fact, all);
      EXPECT_TRUE(found || soft) << fact;
      ++(soft ? count.soft : count.facts);
      if (soft && found) ++count.softFound;
    }
    for (const auto& [metric, count] : counts) {
      std::cout << name << ' ' << metric << ": expected " << count.facts << ", may be "
                << count.soft << " found " << count.softFound << ", told " << count.told
                << ", of gain control " << count.furtherSignals << '\n';
    }
  }
}

// As another reader of the same bits shows it.
TEST(UmtsCaptures, TellTheCellsSystemInformation) {
  const auto names = test::captureNames();
  if (std::ranges::count(names, "umts_gsm_2015") == 0) GTEST_SKIP() << "no such log";
  std::map<std::uint32_t, std::string> last;
  for (const ToldMetric& told : test::readCapture("umts_gsm_2015")) {
    auto dictionary = findMetricMessage(told.metric)->describe(told.payload);
    dictionary->remove("timestamp");
    last[told.metric] = jsonText(*dictionary);
  }
  EXPECT_EQ(last[metric::kUmtsRrcConfig], R"({"drx_cycle_length_ms": 1280})");
  EXPECT_EQ(last[metric::kUmtsSelRes],
            R"({"hsdpa_capable": 1, "edch_capable": 1, "duplex_mode": "FDD", )"
            R"("multi_band_info": [], "cell_barred": 0, "fach_meas_occ_info_present": 1, )"
            R"("s_intrasearch": 16, "s_intersearch": 16, "s_search_rat": 0, "s_cell_prio": 3, )"
            R"("eutra_prio_info": [{"earfcn": 1975, "prio": 7}, {"earfcn": 825, "prio": 7}, )"
            R"({"earfcn": 5780, "prio": 7}]})");
  EXPECT_NE(last[metric::kUmtsCellInfo].find("SYS_HS_IND_HSDPA_HSUPA_SUPP_CELL"),
            std::string::npos);
}

}  // namespace
}  // namespace qel::diagnostics
