// What is known to be in raw logs of real modems comes out for LTE's cells, levels, neighbours and
// power, and nothing else does. Skipped without the logs.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <map>
#include <set>

#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "sources/Metrics.h"
#include "support/diagnostics/CaptureRun.h"

namespace qel::diagnostics {
namespace {

using nlohmann::json;
using test::ToldMetric;

json servingCell(const ToldMetric& told) {
  const auto cell = KCellularLteScellInfo::initWithData(told.payload);
  return {{{"phy_cell_id", cell->phyCellId()},
           {"dl_freq", cell->dlFreq()},
           {"ul_freq", cell->ulFreq()},
           {"dl_bw", cell->dlBw()},
           {"ul_bw", cell->ulBw()},
           {"cell_id", cell->cellId()},
           {"freq_band_ind", cell->freqBandInd()},
           {"tracking_area_code", cell->trackingAreaCode()},
           {"num_mnc_digits", cell->numMncDigits()},
           {"sel_plmn_mcc", cell->selPlmnMcc()},
           {"sel_plmn_mnc", cell->selPlmnMnc()}}};
}

json receivers(const ToldMetric& told) {
  const auto measurement = KCellularLteServingCellMeasurement::initWithData(told.payload);
  json list = json::array();
  for (const auto& receiver : measurement->rxInfos()) {
    list.push_back({{"rx", list.size()},
                    {"rssi", receiver->rssi()},
                    {"rsrp_range", receiver->rsrpRange()},
                    {"rsrq_range", receiver->rsrqRange()},
                    {"snr", receiver->snr()}});
  }
  return {{{"rx_info", list}}};
}

json samples(const ToldMetric& told) {
  json list = json::array();
  const auto message = KCellularLteRsrpRsrqSinr::initWithData(told.payload);
  for (const auto& sample : message->instValues()) {
    list.push_back({{"phy_cell_id", sample->phyCellId()},
                    {"rsrp0", sample->rsrp0()},
                    {"rsrp1", sample->rsrp1()},
                    {"rsrq0", sample->rsrq0()},
                    {"rsrq1", sample->rsrq1()},
                    {"sinr0", sample->sinr0()},
                    {"sinr1", sample->sinr1()}});
  }
  return list;
}

json powers(const ToldMetric& told) {
  json list = json::array();
  const auto message = KCellularLteTxPower::initWithData(told.payload);
  for (const auto& power : message->txPowerInfos()) {
    json entry = {{"subframe_index", power->subframeIndex()}};
    if (power->hasPuschTxPower()) entry["pusch_tx_power"] = power->puschTxPower();
    if (power->hasPucchTxPower()) entry["pucch_tx_power"] = power->pucchTxPower();
    list.push_back(entry);
  }
  return list;
}

json neighbours(const ToldMetric& told) {
  json list = json::array();
  const auto message = KCellularLteNbrEutraCellMeas::initWithData(told.payload);
  for (const auto& cell : message->measNbrEutras()) {
    json entry = {{"nbr_earfcn", cell->nbrEarfcn()}, {"nbr_phys_cell_id", cell->nbrPhysCellId()}};
    if (cell->hasNbrRsrp()) entry["nbr_rsrp"] = cell->nbrRsrp();
    if (cell->hasNbrRsrq()) entry["nbr_rsrq"] = cell->nbrRsrq();
    list.push_back(entry);
  }
  return list;
}

// How a metric's payload becomes entries that look like the facts' keys.
const std::map<std::uint32_t, json (*)(const ToldMetric&)> kEntries = {
    {metric::kLteScellInfo, servingCell}, {metric::kLteServingMeasurement, receivers},
    {metric::kLteRsrpRsrqSinr, samples},  {metric::kLteTxPower, powers},
    {metric::kLteNeighbours, neighbours},
};

bool isMeasured(const std::string& key) {
  static const std::set<std::string> kMeasured = {
      "rssi",  "rsrp_range", "rsrq_range", "snr",   "rsrp0",    "rsrp1",
      "rsrq0", "rsrq1",      "sinr0",      "sinr1", "nbr_rsrp", "nbr_rsrq",
  };
  return kMeasured.count(key) > 0;
}

// Every member of `wanted` is in `found`; measured numbers may be rounded the other way.
bool holds(const json& found, const json& wanted) {
  if (wanted.is_array()) {
    return found.is_array() && found.size() == wanted.size() &&
           std::equal(found.begin(), found.end(), wanted.begin(), holds);
  }
  for (const auto& [key, value] : wanted.items()) {
    if (!found.contains(key)) return false;
    if (value.is_structured()) {
      if (!holds(found[key], value)) return false;
    } else if (std::abs(found[key].get<int>() - value.get<int>()) > (isMeasured(key) ? 1 : 0)) {
      return false;
    }
  }
  return true;
}

bool holdsAny(const json& entries, const json& wanted) {
  return std::any_of(entries.begin(), entries.end(),
                     [&](const json& entry) { return holds(entry, wanted); });
}

// By the packet, then by the metric.
using Entries = std::map<std::pair<std::size_t, std::uint32_t>, json>;

Entries entriesOf(const std::vector<ToldMetric>& told) {
  Entries entries;
  for (const ToldMetric& one : told) {
    if (kEntries.count(one.metric) == 0) continue;
    json& list = entries.try_emplace({one.number, one.metric}, json::array()).first->second;
    for (const json& entry : kEntries.at(one.metric)(one)) list.push_back(entry);
  }
  return entries;
}

struct Score {
  int expected = 0, found = 0, soft = 0, softFound = 0, told = 0, extra = 0;
};

using Scores = std::map<std::uint32_t, Score>;

void countFacts(const Entries& told, const std::vector<json>& facts, Scores& scores) {
  const json nothing = json::array();
  for (const json& fact : facts) {
    const std::uint32_t metric = fact["metric"];
    if (kEntries.count(metric) == 0) continue;
    json wanted = fact["key"];
    if (fact.contains("opt")) {
      for (const auto& [key, value] : fact["opt"].items()) {
        if (key.rfind("tdd_", 0) != 0) wanted[key] = value;  // they come of other packets
      }
    }
    const auto entries = told.find({fact["n"], metric});
    const json& found = entries == told.end() ? nothing : entries->second;
    const bool isFound = holdsAny(found, wanted);
    const bool isSoft = fact.value("soft", false);
    Score& score = scores[metric];
    ++(isSoft ? score.soft : score.expected);
    if (isFound) ++(isSoft ? score.softFound : score.found);
    if (!isFound && !isSoft) ADD_FAILURE() << fact << " found " << found;
  }
}

// An entry is right when a fact of this packet or of an earlier one says it: what was measured
// stays for a while.
void countExtras(const Entries& told, const std::vector<json>& facts, Scores& scores) {
  std::map<std::uint32_t, std::set<json>> known;
  std::map<std::uint32_t, std::set<json>> right;
  auto fact = facts.begin();
  for (const auto& [place, entries] : told) {
    const auto& [number, metric] = place;
    for (; fact != facts.end() && (*fact)["n"] <= number; ++fact) {
      known[(*fact)["metric"]].insert((*fact)["key"]);
    }
    ++scores[metric].told;
    for (const json& entry : entries) {
      if (right[metric].count(entry) > 0) continue;
      const bool isRight = std::any_of(known[metric].begin(), known[metric].end(),
                                       [&](const json& key) { return holds(entry, key); });
      if (isRight) {
        right[metric].insert(entry);
        continue;
      }
      ++scores[metric].extra;
      ADD_FAILURE() << "packet " << number << " told " << metric << " " << entry;
    }
  }
}

TEST(LteCaptures, TellWhatIsKnownToBeInThemAndNothingElse) {
  const auto names = test::captureNames();
  if (names.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no captures";
  int expected = 0;
  for (const std::string& name : names) {
    SCOPED_TRACE(name);
    const Entries told = entriesOf(test::readCapture(name));
    const auto facts = test::factsOf(name);
    Scores scores;
    countFacts(told, facts, scores);
    countExtras(told, facts, scores);
    for (const auto& [metric, score] : scores) {
      expected += score.expected;
      std::cout << name << " " << metric << ": expected " << score.expected << " found "
                << score.found << ", may be " << score.soft << " found " << score.softFound
                << ", told " << score.told << " extra " << score.extra << "\n";
    }
  }
  EXPECT_GT(expected, 0);
}

}  // namespace
}  // namespace qel::diagnostics
