// The simulated drive as a world: what its events say about one another.
#include <gmock/gmock.h>

#include <map>
#include <optional>
#include <set>
#include <utility>

#include "base/Rendering.h"
#include "sources/Metrics.h"
#include "sources/support/DriveLog.h"
#include "tesk/Constants.h"

namespace qel {
namespace {

using namespace sources;
using testing::drive;
using testing::DriveEvent;
using testing::driveOf;
using testing::entriesOf;
using testing::integerOf;
using testing::textOf;

constexpr std::uint64_t kSeeds[] = {1, 2, 5, 42};

// A cell by its channel and code.
using CellKey = std::pair<std::int64_t, std::int64_t>;

struct CellList {
  std::uint32_t metric;
  const char* list;
  const char* channel;
  const char* code;
};

std::set<CellKey> cellsIn(const DriveEvent& event, const CellList& list) {
  std::set<CellKey> cells;
  for (const Dictionary& entry : entriesOf(event.message, list.list)) {
    const CellKey cell{integerOf(entry, list.channel), integerOf(entry, list.code)};
    EXPECT_TRUE(cells.insert(cell).second) << "twice in one report: " << jsonText(entry);
  }
  return cells;
}

struct ServingAndNeighbours {
  std::uint32_t serving;
  const char* channel;
  const char* code;
  CellList neighbours;
};

constexpr ServingAndNeighbours kTechnologies[] = {
    {metric::kLteScellInfo,
     "dl_freq",
     "phy_cell_id",
     {metric::kLteNeighbours, "meas_nbr_eutra", "nbr_earfcn", "nbr_phys_cell_id"}},
    {metric::kUmtsCellInfo,
     "dl_uarfcn",
     "psc",
     {metric::kUmtsNeighbours, "meas_utra_result", "uarfcn", "psc"}},
    {metric::kGsmScellInfo,
     "arfcn",
     "bsic",
     {metric::kGsmNeighbours, "gsm_ncell_meas", "arfcn", "bsic"}},
};

TEST(SimulatedWorld, NeighboursNeverContainTheServingCell) {
  for (const std::uint64_t seed : kSeeds) {
    for (const ServingAndNeighbours& technology : kTechnologies) {
      std::optional<CellKey> serving;
      for (const DriveEvent& event : drive(seed)) {
        if (event.metric == technology.serving) {
          serving = {integerOf(event.message, technology.channel),
                     integerOf(event.message, technology.code)};
        }
        if (event.metric != technology.neighbours.metric) continue;
        ASSERT_TRUE(serving) << "a neighbour before there is a serving cell";
        ASSERT_FALSE(cellsIn(event, technology.neighbours).contains(*serving))
            << event.elapsedMs << " ms, seed " << seed;
      }
    }
  }
}

TEST(SimulatedWorld, ACellIsANeighbourBeforeItServes) {
  for (const std::uint64_t seed : kSeeds) {
    for (const ServingAndNeighbours& technology : kTechnologies) {
      std::set<CellKey> seen;
      std::optional<CellKey> serving;
      int changes = 0;
      for (const DriveEvent& event : drive(seed)) {
        if (event.metric == technology.neighbours.metric) {
          seen.merge(cellsIn(event, technology.neighbours));
        }
        // The first cell after another technology comes from elsewhere.
        const bool elsewhere = std::ranges::any_of(kTechnologies, [&](const auto& other) {
          return other.serving == event.metric && other.serving != technology.serving;
        });
        if (elsewhere) serving.reset();
        if (event.metric != technology.serving) continue;
        const CellKey cell{integerOf(event.message, technology.channel),
                           integerOf(event.message, technology.code)};
        if (serving && cell != *serving) {
          ++changes;
          EXPECT_TRUE(seen.contains(cell)) << event.elapsedMs << " ms, seed " << seed;
        }
        serving = cell;
        seen.insert(cell);
      }
      if (technology.serving == metric::kLteScellInfo) {
        EXPECT_GE(changes, 8) << seed;
      }
    }
  }
}

// A neighbour of the serving carrier must not stay well over the serving cell for long.
TEST(SimulatedWorld, TheServingCellIsTheStrongestUpToHysteresis) {
  constexpr std::int64_t kWellOverDb = 7;
  constexpr std::uint64_t kLongMs = 5000;
  for (const std::uint64_t seed : kSeeds) {
    std::int64_t carrier = 0;
    std::optional<std::int64_t> servingDbm;
    std::uint64_t notOverMs = 0;
    for (const DriveEvent& event : drive(seed)) {
      // Elsewhere there is no serving cell of LTE to compare with.
      if (event.metric == metric::kUmtsCellInfo || event.metric == metric::kGsmScellInfo) {
        notOverMs = event.elapsedMs;
      }
      if (event.metric == metric::kLteScellInfo) carrier = integerOf(event.message, "dl_freq");
      if (event.metric == metric::kLteRsrpRsrqSinr) {
        const Dictionary& average = *event.message.find("avg_values")->asDictionary();
        servingDbm = (integerOf(average, "rsrp0") + integerOf(average, "rsrp1")) / 2;
      }
      if (event.metric != metric::kLteNeighbours || !servingDbm) continue;
      bool over = false;
      for (const Dictionary& entry : entriesOf(event.message, "meas_nbr_eutra")) {
        if (integerOf(entry, "nbr_earfcn") != carrier) continue;
        over = over || integerOf(entry, "nbr_rsrp") - 140 > *servingDbm + kWellOverDb;
      }
      if (!over) notOverMs = event.elapsedMs;
      ASSERT_LE(event.elapsedMs - notOverMs, kLongMs) << event.elapsedMs << " ms, seed " << seed;
    }
  }
}

TEST(SimulatedWorld, TheSampledCellIsTheServingCell) {
  std::int64_t serving = 0;
  std::int64_t before = 0;
  for (const DriveEvent& event : drive(1)) {
    if (event.metric == metric::kLteScellInfo) {
      const std::int64_t cell = integerOf(event.message, "phy_cell_id");
      if (cell != serving) before = std::exchange(serving, cell);
    }
    if (event.metric != metric::kLteRsrpRsrqSinr) continue;
    const Dictionary& average = *event.message.find("avg_values")->asDictionary();
    EXPECT_EQ(integerOf(average, "phy_cell_id"), serving);
    for (const Dictionary& sample : entriesOf(event.message, "inst_values")) {
      EXPECT_THAT(integerOf(sample, "phy_cell_id"), ::testing::AnyOf(serving, before));
    }
  }
}

TEST(SimulatedWorld, AnAverageLiesBetweenItsSamples) {
  for (const DriveEvent& event : driveOf(1, metric::kLteRsrpRsrqSinr)) {
    const auto samples = entriesOf(event.message, "inst_values");
    EXPECT_EQ(std::ssize(samples), integerOf(event.message, "num_samples"));
    const Dictionary& average = *event.message.find("avg_values")->asDictionary();
    for (const char* key : {"rsrp0", "rsrp1", "rsrq0", "rsrq1", "sinr0", "sinr1"}) {
      const auto value = [&](const Dictionary& sample) { return integerOf(sample, key); };
      EXPECT_GE(integerOf(average, key), value(std::ranges::min(samples, {}, value)) - 1);
      EXPECT_LE(integerOf(average, key), value(std::ranges::max(samples, {}, value)) + 1);
    }
  }
}

TEST(SimulatedWorld, LteConnectionStatesFollowOneAnother) {
  const std::map<std::string_view, std::set<std::string_view>> allowed = {
      {"KLTE_RRC_STATE_NULL", {"KLTE_RRC_STATE_IDLE"}},
      {"KLTE_RRC_STATE_IDLE", {"KLTE_RRC_STATE_ATMPT_CONNECTION", "KLTE_RRC_STATE_NULL"}},
      {"KLTE_RRC_STATE_ATMPT_CONNECTION",
       {"KLTE_RRC_STATE_CONNECTED", "KLTE_RRC_STATE_IDLE", "KLTE_RRC_STATE_ENDING",
        "KLTE_RRC_STATE_NULL"}},
      {"KLTE_RRC_STATE_CONNECTED",
       {"KLTE_RRC_STATE_ENDING", "KLTE_RRC_STATE_ATMPT_CONNECTION", "KLTE_RRC_STATE_NULL"}},
      {"KLTE_RRC_STATE_ENDING", {"KLTE_RRC_STATE_IDLE", "KLTE_RRC_STATE_NULL"}},
  };
  for (const std::uint64_t seed : kSeeds) {
    std::string last = "KLTE_RRC_STATE_NULL";
    std::uint64_t sinceMs = 0;
    for (const DriveEvent& event : driveOf(seed, metric::kLteRrcState)) {
      const std::string state(textOf(event.message, "state"));
      EXPECT_EQ(textOf(event.message, "prev_state"), last) << event.elapsedMs;
      EXPECT_TRUE(allowed.at(last).contains(state)) << last << " to " << state;
      if (event.elapsedMs > 1000) {
        EXPECT_NEAR(static_cast<double>(integerOf(event.message, "prev_state_dur_ms")),
                    static_cast<double>(event.elapsedMs - sinceMs), 1);
      }
      last = state;
      sinceMs = event.elapsedMs;
    }
  }
}

TEST(SimulatedWorld, AConnectedPhoneSendsAndAnIdleOneDoesNot) {
  for (const std::uint64_t seed : kSeeds) {
    std::string state;
    for (const DriveEvent& event : drive(seed)) {
      if (event.metric == metric::kLteRrcState) state = textOf(event.message, "state");
      if (event.metric == metric::kLteTxPower || event.metric == metric::kLteCdrxConfig) {
        ASSERT_EQ(state, "KLTE_RRC_STATE_CONNECTED") << event.elapsedMs << " ms, seed " << seed;
      }
      if (event.metric == metric::kLteCarrierAggregation &&
          !entriesOf(event.message, "scc_list").empty()) {
        ASSERT_EQ(state, "KLTE_RRC_STATE_CONNECTED") << event.elapsedMs << " ms, seed " << seed;
      }
      if (event.metric == metric::kLteServingMeasurement) {
        ASSERT_EQ(*event.message.find("is_connected_mode")->asBoolean(),
                  state == "KLTE_RRC_STATE_CONNECTED");
      }
    }
  }
}

TEST(SimulatedWorld, TheWeakerTheCellTheMoreThePhoneSends) {
  std::map<bool, std::pair<double, int>> powers;  // by: cell weaker than -95 dBm
  std::int64_t servingDbm = 0;
  for (const DriveEvent& event : drive(1)) {
    if (event.metric == metric::kLteRsrpRsrqSinr) {
      servingDbm = integerOf(*event.message.find("avg_values")->asDictionary(), "rsrp0");
    }
    if (event.metric != metric::kLteTxPower || servingDbm == 0) continue;
    for (const Dictionary& entry : entriesOf(event.message, "tx_power_info")) {
      auto& [sum, count] = powers[servingDbm < -90];
      sum += static_cast<double>(integerOf(entry, "pucch_tx_power"));
      ++count;
    }
  }
  ASSERT_EQ(powers.size(), 2U);
  const auto mean = [&](bool weak) { return powers[weak].first / powers[weak].second; };
  EXPECT_GT(mean(true), mean(false) + 8);
}

TEST(SimulatedWorld, CarriersAreTheServingCellAndOthersOfIt) {
  for (const std::uint64_t seed : kSeeds) {
    CellKey serving;
    std::vector<std::int64_t> secondary;
    bool activated = false;
    for (const DriveEvent& event : drive(seed)) {
      if (event.metric == metric::kLteScellInfo) {
        serving = {integerOf(event.message, "dl_freq"), integerOf(event.message, "phy_cell_id")};
      }
      if (event.metric == metric::kLteCarrierAggregation) {
        secondary.clear();
        for (const Dictionary& entry : entriesOf(event.message, "scc_list")) {
          secondary.push_back(integerOf(entry, "dl_earfcn"));
          EXPECT_NE(secondary.back(), serving.first);
          activated = activated || textOf(entry, "state") == "SCC_STATE_ACTIVATED";
        }
      }
      if (event.metric != metric::kLteComponentCarriers) continue;
      EXPECT_EQ(integerOf(event.message, "pcc_earfcn"), serving.first);
      EXPECT_EQ(event.message.contains("scc0_earfcn"), !secondary.empty());
      if (!secondary.empty()) {
        EXPECT_EQ(integerOf(event.message, "scc0_earfcn"), secondary[0]);
      }
      EXPECT_EQ(event.message.contains("scc1_earfcn"), secondary.size() > 1);
    }
    EXPECT_TRUE(activated) << seed;
  }
}

TEST(SimulatedWorld, RegistrationFollowsTheCellAndBringsNewIdentities) {
  for (const std::uint64_t seed : kSeeds) {
    std::int64_t cellArea = 0;
    std::uint64_t cellSinceMs = 0;
    std::set<std::int64_t> identities;
    std::set<std::int64_t> areas;
    bool updated = false;
    for (const DriveEvent& event : drive(seed)) {
      if (event.metric == metric::kLteScellInfo) {
        const std::int64_t area = integerOf(event.message, "tracking_area_code");
        if (area != cellArea) cellSinceMs = event.elapsedMs;
        cellArea = area;
      }
      if (event.metric != metric::kEmmContext) continue;
      updated = updated || textOf(event.message, "reg_proc") == "EMM_PROC_TAU_COMB";
      identities.insert(integerOf(*event.message.find("guti")->asDictionary(), "m_tmsi"));
      if (textOf(event.message, "reg_status") != "KREG_STATUS_NORMAL_SERVICE") continue;
      const std::int64_t area = integerOf(entriesOf(event.message, "tai_list").at(0), "tac");
      areas.insert(area);
      // Within some seconds of a new area, the phone is registered in it.
      if (event.elapsedMs - cellSinceMs > 15'000) {
        EXPECT_EQ(area, cellArea) << event.elapsedMs;
      }
    }
    EXPECT_TRUE(updated);
    EXPECT_GE(areas.size(), 3U) << seed;
    EXPECT_GE(identities.size(), 3U) << seed;
  }
}

TEST(SimulatedWorld, LocationAndRoutingAreaAreThoseOfTheCellOutsideLte) {
  for (const std::uint64_t seed : kSeeds) {
    std::optional<std::int64_t> cellArea;
    std::uint64_t sinceMs = 0;
    bool compared = false;
    for (const DriveEvent& event : drive(seed)) {
      if (event.metric == metric::kLteScellInfo) cellArea.reset();
      if (event.metric == metric::kUmtsCellInfo || event.metric == metric::kGsmScellInfo) {
        const std::int64_t area = integerOf(event.message, "lac");
        if (area != cellArea) sinceMs = event.elapsedMs;
        cellArea = area;
      }
      if (event.metric != metric::kGmmContext || !cellArea) continue;
      if (event.elapsedMs - sinceMs < 12'000) continue;
      EXPECT_EQ(integerOf(*event.message.find("rai")->asDictionary(), "lac"), *cellArea)
          << event.elapsedMs << " ms, seed " << seed;
      compared = true;
    }
    EXPECT_TRUE(compared);
  }
}

TEST(SimulatedWorld, NetworkIdentitiesAreThoseForTests) {
  const Value plmn{Bytes{0x00, 0xF1, 0x10}};
  for (const DriveEvent& event : driveOf(1, metric::kMmContext)) {
    EXPECT_EQ(*event.message.find("lai")->asDictionary()->find("encoded_plmn"), plmn);
  }
  for (const DriveEvent& event : driveOf(1, metric::kMmCommonInfo)) {
    EXPECT_EQ(*event.message.find("imsi"),
              Value(Bytes{0x08, 0x09, 0x10, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98}));
  }
}

TEST(SimulatedWorld, BearersHaveAddressesForDocumentationAndAreCounted) {
  std::set<std::string> names;
  for (const DriveEvent& event : driveOf(1, metric::kBearers)) {
    const auto bearers = entriesOf(event.message, "bearer_contexts");
    EXPECT_EQ(std::ssize(bearers), integerOf(event.message, "bearer_context_count"));
    for (const Dictionary& bearer : bearers) {
      names.emplace(textOf(bearer, "apn"));
      for (const char* key : {"primary_dns_addr", "secondary_dns_addr"}) {
        const Bytes& address = *bearer.find(key)->asBytes();
        const Bytes v4 = {192, 0, 2};
        const Bytes v6 = {0x20, 0x01, 0x0D, 0xB8};
        const bool isV4 =
            address.size() == 4 && std::ranges::equal(v4, std::span(address).first(3));
        const bool isV6 =
            address.size() == 16 && std::ranges::equal(v6, std::span(address).first(4));
        EXPECT_TRUE(isV4 || isV6) << jsonText(bearer);
        const std::string type(
            textOf(bearer, key[0] == 'p' ? "primary_dns_type" : "secondary_dns_type"));
        EXPECT_EQ(type, isV4 ? "PDP_TYPE_IPv4" : "PDP_TYPE_IPv6");
      }
    }
  }
  EXPECT_EQ(names, (std::set<std::string>{"internet", "ims", "mms"}));
}

TEST(SimulatedWorld, ARadioLinkFailureIsRecoveredFrom) {
  for (const std::uint64_t seed : kSeeds) {
    const auto failures = driveOf(seed, metric::kLteRadioLinkFailure);
    ASSERT_FALSE(failures.empty()) << seed;
    std::string cause;
    bool connectedAgain = false;
    for (const DriveEvent& event : driveOf(seed, metric::kLteRrcState)) {
      if (event.elapsedMs < failures[0].elapsedMs) continue;
      if (cause.empty()) cause = textOf(event.message, "cause");
      connectedAgain =
          connectedAgain || textOf(event.message, "state") == "KLTE_RRC_STATE_CONNECTED";
    }
    EXPECT_EQ(cause, "KLTE_RRC_CAUSE_REEST_OTHER_FAIL_T310_EXP");
    EXPECT_TRUE(connectedAgain);
  }
}

}  // namespace
}  // namespace qel
