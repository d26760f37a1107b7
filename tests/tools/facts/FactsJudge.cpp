#include "tools/facts/FactsJudge.h"

#include <algorithm>
#include <cmath>
#include <fstream>
#include <nlohmann/json.hpp>
#include <optional>
#include <set>
#include <sstream>

#include "base/Rendering.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/lte_rrc.h"
#include "recording/RecordingReader.h"
#include "tools/facts/FrameTimes.h"

namespace qel::testing {
namespace {

using nlohmann::json;

constexpr std::size_t kMostComplaints = 6;  // of a metric
constexpr std::int64_t kRrcState = 19972;
constexpr std::int64_t kEnding = 4;
constexpr std::int64_t kNeighbours = 54031;
constexpr std::int64_t kSamples = 20330;
constexpr std::uint64_t kSamplesWaitMs = 120'000;
constexpr std::uint64_t kKeptMs = 61'000;  // what was measured holds for this long at most

// Facts have the carriers of the first list alone; release 12 has another one.
constexpr const char* kCarriers = "nbr_eutra";
// What stands for a carrier or a band that a later list names: facts have it as it stands.
constexpr std::int64_t kCarrierElsewhere = 65535;
constexpr std::int64_t kBandElsewhere = 64;
constexpr const char* kBands = "multi_band_info";
// What facts tell in part only: of UMTS's receivers what they measure when idle, and one of the
// transmission modes.
const std::map<std::int64_t, std::string> kPartlyKnown = {{53506, "rx_info"},
                                                          {19992, "transmission_mode"}};

// Where rounding may differ by one.
const std::set<std::string> kMeasured = {"ecno",           "nbr_rsrp", "nbr_rsrq", "pucch_tx_power",
                                         "pusch_tx_power", "rscp",     "rsrp0",    "rsrp1",
                                         "rsrp_range",     "rsrq0",    "rsrq1",    "rsrq_range",
                                         "rssi",           "sinr0",    "sinr1",    "snr"};

struct Fact {
  std::int64_t metric;
  std::string name;  // with its group
  FrameTime time;
  json key;
  json opt;
  json all;  // both
  bool isSoft;
  std::string text;
};

struct Told {
  std::int64_t metric;
  std::uint64_t timeMs;
  bool isOfFurtherRadio;  // facts do not tell a modem's radios apart
  json values;
  std::vector<json> candidates;
};

bool isEqual(const std::string& name, const json& expected, const json& told);

// Every field of the key is there and right; of the others, those that are there are right.
bool isMatch(const json& key, const json& opt, const json& told) {
  for (const auto& [name, expected] : key.items()) {
    if (name == "opt") continue;
    if (!told.contains(name) || !isEqual(name, expected, told[name])) return false;
  }
  const json& further = key.contains("opt") ? key["opt"] : opt;
  for (const auto& [name, expected] : further.items()) {
    if (told.contains(name) && !isEqual(name, expected, told[name])) return false;
  }
  return true;
}

// Whether the element of that receiver is right.
bool isReceiver(const json& wanted, const json& told) {
  const auto receiver = wanted["rx"].get<std::size_t>();
  json values = wanted;
  values.erase("rx");
  return receiver < told.size() && isMatch(values, {}, told[receiver]);
}

// As many as expected, each one right, in any order, but those of receivers.
bool isEqualList(const std::string& name, const json& expected, const json& told) {
  if (!told.is_array() || told.size() < expected.size()) return false;
  if (told.size() > expected.size() && name != kCarriers) return false;
  for (const json& wanted : expected) {
    if (wanted.is_object() && wanted.contains("rx")) {
      if (!isReceiver(wanted, told)) return false;
      continue;
    }
    bool any = name == kBands && wanted == kBandElsewhere;
    for (const json& element : told) {
      any = any || (wanted.is_object() ? element.is_object() && isMatch(wanted, {}, element)
                                       : isEqual(name, wanted, element));
    }
    if (!any) return false;
  }
  return true;
}

bool isEqual(const std::string& name, const json& expected, const json& told) {
  if (expected.is_object() && expected.contains("any")) {
    for (const json& choice : expected["any"]) {
      if (isEqual(name, choice, told)) return true;
    }
    return false;
  }
  if (expected.is_array()) return isEqualList(name, expected, told);
  const auto number = [](const json& value) -> std::optional<double> {
    if (value.is_boolean()) return value.get<bool>() ? 1 : 0;
    if (value.is_number()) return value.get<double>();
    return std::nullopt;
  };
  const auto wanted = number(expected);
  const auto is = number(told);
  if (!wanted || !is) return expected == told;
  return std::abs(*wanted - *is) <= (kMeasured.contains(name) ? 1.0 : 0.0);
}

// The dictionary by itself, and with each of those in its lists.
void addCandidates(const json& values, json above, std::vector<json>& candidates) {
  for (const auto& [name, value] : values.items()) above[name] = value;
  candidates.push_back(above);
  for (const auto& [name, value] : values.items()) {
    if (value.is_object()) addCandidates(value, above, candidates);
    if (!value.is_array()) continue;
    for (const json& element : value) {
      if (element.is_object()) addCandidates(element, above, candidates);
    }
  }
}

std::vector<Fact> readFacts(const std::string& path, const std::vector<FrameTime>& times) {
  std::ifstream file(path);
  std::vector<Fact> facts;
  std::string line;
  while (std::getline(file, line)) {
    const json read = json::parse(line);
    const auto metric = read["metric"].get<std::int64_t>();
    const auto frame = read["n"].get<std::size_t>();
    const std::string group = read.value("group", "");
    facts.push_back({metric, std::to_string(metric) + (group.empty() ? "" : " " + group),
                     frame >= 1 && frame <= times.size() ? times[frame - 1] : FrameTime(),
                     read["key"], read.value("opt", json::object()), read["key"],
                     read.value("soft", false), line});
    for (const auto& [name, value] : facts.back().opt.items()) facts.back().all[name] = value;
  }
  return facts;
}

// Facts have the numbers of states and causes, not their names.
void putNumbers(json& values, const Bytes& payload) {
  const auto state = KCellularLteRrcState::initWithData(payload);
  if (state->hasState()) values["state"] = state->state();
  if (state->hasPrevState()) values["prev_state"] = state->prevState();
  if (state->hasCause()) values["cause"] = state->cause();
}

std::vector<Told> readRecording(const std::string& path) {
  std::vector<Told> told;
  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
  while (reader) {
    const auto event = reader->next();
    if (!event) break;
    const auto metric = *event->entries.find("kKeyMetricID")->asInt64() - kMetricEventBase;
    const MetricMessage* row = findMetricMessage(static_cast<std::uint32_t>(metric));
    const Bytes payload = *event->entries.find("kKeyPayload")->asBytes();
    const bool isFurther = *event->entries.find("kKeyProfileID")->asInt64() > 0;
    told.push_back(
        {metric, event->timeMs, isFurther, json::parse(jsonText(*row->describe(payload))), {}});
    if (metric == kRrcState) putNumbers(told.back().values, payload);
    addCandidates(told.back().values, json::object(), told.back().candidates);
  }
  return told;
}

bool isIn(const Fact& fact, const Told& told) {
  for (const json& candidate : told.candidates) {
    if (isMatch(fact.key, fact.opt, candidate)) return true;
  }
  return false;
}

// Samples may be gathered before they are told.
bool mayTell(const Fact& fact, const Told& told) {
  if (fact.metric != told.metric) return false;
  if (fact.metric != kSamples) return fact.time.holds(told.timeMs);
  return told.timeMs + 1 >= fact.time.firstMs && told.timeMs < fact.time.lastMs + kSamplesWaitMs;
}

std::set<std::string> namesIn(const json& key) {
  std::set<std::string> names;
  for (const auto& [name, value] : key.items()) names.insert(name);
  return names;
}

bool hasAll(const json& candidate, const std::set<std::string>& names) {
  for (const std::string& name : names) {
    if (!candidate.contains(name)) return false;
  }
  return !names.empty();
}

// Whether some fact that is not too old says what the candidate says under these names.
bool isBacked(const Told& told, const json& candidate, const std::set<std::string>& names,
              const std::vector<Fact>& facts) {
  return std::any_of(facts.rbegin(), facts.rend(), [&](const Fact& fact) {
    if (fact.metric != told.metric || fact.time.firstMs > told.timeMs + 1) return false;
    if (fact.metric == kRrcState && !fact.time.holds(told.timeMs)) return false;
    if (fact.metric == kNeighbours && fact.time.lastMs + kKeptMs < told.timeMs) return false;
    return hasAll(fact.all, names) &&
           isMatch(fact.key, fact.isSoft ? json::object() : fact.opt, candidate);
  });
}

bool hasCarrierElsewhere(const json& candidate) {
  const json carriers = candidate.value(kCarriers, json::array());
  return std::any_of(carriers.begin(), carriers.end(), [](const json& carrier) {
    return carrier.value("earfcn", std::int64_t{0}) >= kCarrierElsewhere;
  });
}

class Court {
 public:
  Court(std::vector<Fact> facts, std::vector<Told> told)
      : _facts(std::move(facts)), _told(std::move(told)) {}

  Verdict verdict() {
    for (const Fact& fact : _facts) judgeFact(fact);
    for (const Fact& fact : _facts) _names[fact.metric].insert(namesIn(fact.key));
    for (const Told& told : _told) judgeTold(told);
    return _verdict;
  }

 private:
  void judgeFact(const Fact& fact) {
    MetricVerdict& row = _verdict.metrics[fact.name];
    ++row.expected;
    for (const Told& told : _told) {
      if (mayTell(fact, told) && isIn(fact, told)) {
        ++row.found;
        return;
      }
    }
    ++(fact.isSoft ? row.softMissing : row.missing);
    if (!fact.isSoft) complain(fact.name, "missing: " + fact.text + nearest(fact));
  }

  std::string nearest(const Fact& fact) const {
    for (const Told& told : _told) {
      if (mayTell(fact, told)) return "\n    told: " + told.values.dump();
    }
    return "\n    told: nothing";
  }

  void judgeTold(const Told& told) {
    const auto found = _names.find(told.metric);
    if (found == _names.end()) return;
    if (told.metric == kRrcState && told.values.value("state", std::int64_t{0}) == kEnding) return;
    if (told.metric == kRrcState && told.isOfFurtherRadio) return;
    const auto partly = kPartlyKnown.find(told.metric);
    for (const auto& names : found->second) {
      if (partly != kPartlyKnown.end() && names == std::set{partly->second}) continue;
      for (const json& candidate : told.candidates) {
        if (!hasAll(candidate, names) || isBacked(told, candidate, names, _facts)) continue;
        if (names.contains(kCarriers) && hasCarrierElsewhere(candidate)) continue;
        const std::string name = std::to_string(told.metric);
        ++_verdict.metrics[name].extra;
        json shown;
        for (const std::string& key : names) shown[key] = candidate[key];
        complain(name + " extra",
                 "extra at " + std::to_string(told.timeMs) + ": " + name + " " + shown.dump());
        return;
      }
    }
  }

  void complain(const std::string& of, std::string text) {
    if (++_complaints[of] <= kMostComplaints) _verdict.complaints.push_back(std::move(text));
  }

  const std::vector<Fact> _facts;
  const std::vector<Told> _told;
  std::map<std::int64_t, std::set<std::set<std::string>>> _names;  // of each metric's facts
  std::map<std::string, std::size_t> _complaints;
  Verdict _verdict;
};

}  // namespace

std::string Verdict::table() const {
  std::ostringstream text;
  for (const auto& [name, row] : metrics) {
    text << name << ": expected " << row.expected << ", found " << row.found << ", missing "
         << row.missing << ", soft missing " << row.softMissing << ", extra " << row.extra << "\n";
  }
  return text.str();
}

Verdict judge(const std::string& facts, const std::string& log, const std::string& recording) {
  return Court(readFacts(facts, frameTimes(log)), readRecording(recording)).verdict();
}

}  // namespace qel::testing
