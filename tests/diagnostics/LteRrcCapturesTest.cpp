// What is known to be in raw logs of real modems comes out for LTE's connection and rules, and
// nothing else does. Skipped without the logs.
#include <gtest/gtest.h>

#include <algorithm>
#include <iostream>
#include <map>
#include <nlohmann/json.hpp>
#include <set>

#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/lte_rrc.h"
#include "sources/Metrics.h"
#include "support/diagnostics/CaptureRun.h"

namespace qel::diagnostics {
namespace {

using nlohmann::json;
using test::ToldMetric;

const std::set<std::uint32_t> kMetrics = {
    metric::kLteRrcState, metric::kLteCdrxConfig,         metric::kLteRadioLinkFailure,
    metric::kLteSelRes,   metric::kLteCarrierAggregation, metric::kLteComponentCarriers,
    metric::kLteInterRat,
};

bool isEqual(const json& wanted, const json& told);

// The key's members are there and right; of the others, those that are there.
bool holds(const json& key, const json& further, const json& told) {
  for (const auto& [name, wanted] : key.items()) {
    if (name != "opt" && (!told.contains(name) || !isEqual(wanted, told[name]))) return false;
  }
  const json& others = key.contains("opt") ? key["opt"] : further;
  return std::ranges::all_of(others.items(), [&](const auto& item) {
    return !told.contains(item.key()) || isEqual(item.value(), told[item.key()]);
  });
}

bool isEqual(const json& wanted, const json& told) {
  if (wanted.is_array()) {
    return told.is_array() && told.size() == wanted.size() &&
           std::equal(wanted.begin(), wanted.end(), told.begin(), isEqual);
  }
  if (!wanted.is_object()) return wanted == told;
  if (!wanted.contains("any")) return holds(wanted, json::object(), told);
  const json& values = wanted["any"];
  return std::find(values.begin(), values.end(), told) != values.end();
}

// What a fact that need not be found says besides its key rests on all of a modem's radios
// together.
bool holds(const json& fact, const json& told) {
  const bool soft = fact.value("soft", false);
  return holds(fact["key"], soft ? json::object() : fact.value("opt", json::object()), told);
}

// By the packet, then by the metric.
using Entries = std::map<std::pair<std::size_t, std::uint32_t>, std::vector<json>>;

// As the facts have it: enumerations as numbers.
json valuesOf(const ToldMetric& one) {
  const MetricMessage* message = findMetricMessage(one.metric);
  const auto values = message ? message->describe(one.payload) : std::nullopt;
  json entry = values ? json::parse(jsonText(*values)) : json::object();
  if (one.metric == metric::kLteRrcState) {
    const auto state = KCellularLteRrcState::initWithData(one.payload);
    entry["state"] = state->state();
    if (state->hasPrevState()) entry["prev_state"] = state->prevState();
    if (state->hasCause()) entry["cause"] = state->cause();
  }
  return entry;
}

Entries toldIn(const std::string& name) {
  Entries entries;
  for (const ToldMetric& one : test::readCapture(name)) {
    if (kMetrics.count(one.metric) == 0) continue;
    entries[{one.number, one.metric}].push_back(valuesOf(one));
  }
  return entries;
}

// The facts pass over lists that name channels above 65535, and take that phone's two radios for
// one.
bool isBeyondFacts(const std::string& name, std::uint32_t metric,
                   const std::vector<json>& entries) {
  if (metric == metric::kLteRrcState) return name == "wrapper98_2020";
  return metric == metric::kLteSelRes && std::ranges::any_of(entries, [](const json& entry) {
           return std::ranges::any_of(entry["nbr_eutra"], [](const json& frequency) {
             return frequency["earfcn"] > 0xFFFF;
           });
         });
}

struct Score {
  int expected = 0, found = 0, soft = 0, softFound = 0, told = 0, extra = 0;
};
using Scores = std::map<std::uint32_t, Score>;

void judge(const std::string& name, Scores& scores) {
  const Entries told = toldIn(name);
  std::set<std::pair<std::size_t, std::uint32_t>> explained;
  for (const json& fact : test::factsOf(name)) {
    const std::uint32_t metric = fact["metric"];
    if (kMetrics.count(metric) == 0) continue;
    const auto entries = told.find({fact["n"], metric});
    const bool found =
        entries != told.end() &&
        std::ranges::any_of(entries->second, [&](const json& entry) { return holds(fact, entry); });
    const bool soft = fact.value("soft", false);
    Score& score = scores[metric];
    ++(soft ? score.soft : score.expected);
    if (found) ++(soft ? score.softFound : score.found);
    if (found) explained.insert(entries->first);
    EXPECT_TRUE(found || soft) << fact << " told "
                               << (entries == told.end() ? json() : json(entries->second));
  }
  for (const auto& [place, entries] : told) {
    Score& score = scores[place.second];
    ++score.told;
    if (explained.count(place) > 0 || isBeyondFacts(name, place.second, entries)) continue;
    ++score.extra;
    ADD_FAILURE() << "packet " << place.first << " told " << place.second << " " << json(entries);
  }
}

TEST(LteRrcCaptures, TellWhatIsKnownToBeInThemAndNothingElse) {
  const auto names = test::captureNames();
  if (names.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no captures";
  for (const std::string& name : names) {
    SCOPED_TRACE(name);
    Scores scores;
    judge(name, scores);
    for (const auto& [metric, score] : scores) {
      std::cout << name << " " << metric << ": expected " << score.expected << " found "
                << score.found << ", may be " << score.soft << " found " << score.softFound
                << ", told " << score.told << " extra " << score.extra << "\n";
    }
  }
}

}  // namespace
}  // namespace qel::diagnostics
