// The simulated drive as a sequence of events.
#include "sources/simulated/SimulatedDrive.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <set>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "sources/Metrics.h"
#include "sources/simulated/ReportTable.h"
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
using testing::kDriveStartMs;

constexpr std::uint64_t kSeeds[] = {1, 2, 3, 5, 6, 42, 1000};

std::set<std::uint32_t> metricsOf(const std::vector<DriveEvent>& events, std::uint64_t untilMs) {
  std::set<std::uint32_t> metrics;
  for (const DriveEvent& event : events) {
    if (event.elapsedMs <= untilMs && event.metric != 0) metrics.insert(event.metric);
  }
  return metrics;
}

TEST(SimulatedDrive, TheSameSeedAndStartGiveTheSameEventsByteForByte) {
  SimulatedDrive first(7, kDriveStartMs);
  SimulatedDrive second(7, kDriveStartMs);
  for (int i = 0; i < 3000; ++i) {
    const auto a = first.next();
    const auto b = second.next();
    ASSERT_EQ(a->timeMs, b->timeMs);
    ASSERT_EQ(a->stream, b->stream);
    ASSERT_EQ(a->entries, b->entries);
  }
}

TEST(SimulatedDrive, AnotherSeedGivesAnotherDrive) {
  const auto first = driveOf(1, metric::kLteRsrpRsrqSinr);
  const auto second = driveOf(2, metric::kLteRsrpRsrqSinr);
  std::size_t same = 0;
  for (std::size_t i = 0; i < 100; ++i) {
    if (first[i].raw.entries == second[i].raw.entries) ++same;
  }
  EXPECT_LT(same, 5U);
}

TEST(SimulatedDrive, AnotherStartShiftsTheTimesAndNothingElse) {
  SimulatedDrive first(7, 1000);
  SimulatedDrive second(7, 5000);
  for (int i = 0; i < 200; ++i) {
    const auto a = first.next();
    const auto b = second.next();
    ASSERT_EQ(a->timeMs + 4000, b->timeMs);
    ASSERT_EQ(a->stream, b->stream);
  }
}

TEST(SimulatedDrive, TimeNeverGoesBackAndEveryMessageCarriesItsOwn) {
  std::uint64_t lastMs = 0;
  for (const DriveEvent& event : drive(1)) {
    ASSERT_GE(event.elapsedMs, lastMs);
    lastMs = event.elapsedMs;
    if (event.message.empty()) continue;
    ASSERT_EQ(integerOf(event.message, "timestamp"),
              static_cast<std::int64_t>(kDriveStartMs + event.elapsedMs));
  }
}

TEST(SimulatedDrive, EventsHaveTheKeysOfTheModem) {
  for (const DriveEvent& event : drive(1)) {
    std::vector<std::string_view> keys;
    for (const auto& [key, value] : event.raw.entries) keys.push_back(key);
    if (event.metric != 0) {
      EXPECT_THAT(keys, ::testing::ElementsAre("kKeyMetricID", "kKeyProfileID", "kKeyPayload"));
    } else {
      EXPECT_THAT(keys, ::testing::ElementsAre("kKeyTriggerID"));
    }
  }
}

TEST(SimulatedDrive, TenMinutesReportEveryMetricOfTheCatalogueButTheSimFiles) {
  for (const std::uint64_t seed : kSeeds) {
    const auto seen = metricsOf(drive(seed), 600'000);
    for (const MetricName& metric : KBBMetricUtility::catalogue()) {
      EXPECT_EQ(seen.contains(metric.identifier), metric.identifier != metric::kSimFiles)
          << metric.name << ", seed " << seed;
    }
  }
}

TEST(SimulatedDrive, TheReportTableIsTheCatalogue) {
  std::set<std::uint32_t> reported;
  for (const ReportRow& row : reportTable()) {
    EXPECT_TRUE(reported.insert(row.metric).second) << row.metric;
    EXPECT_EQ(row.periodMs % kStepMs, 0U) << row.metric;
    EXPECT_LT(row.phaseMs, kStepMs) << row.metric;
  }
  std::set<std::uint32_t> known;
  for (const MetricName& metric : KBBMetricUtility::catalogue()) known.insert(metric.identifier);
  EXPECT_EQ(reported, known);
}

TEST(SimulatedDrive, TheLteScreensFillWithinTwoSeconds) {
  for (const std::uint64_t seed : kSeeds) {
    EXPECT_THAT(
        metricsOf(drive(seed), 2000),
        ::testing::IsSupersetOf(
            {metric::kLteRrcState, metric::kLteCdrxConfig, metric::kLteScellInfo,
             metric::kLteSelRes, metric::kLteServingMeasurement, metric::kLteTxPower,
             metric::kLteRsrpRsrqSinr, metric::kEmmContext, metric::kLteComponentCarriers,
             metric::kLteCarrierAggregation, metric::kLteInterRat, metric::kLteNeighbours,
             metric::kMmCommonInfo, metric::kBearers, metric::kMmContext, metric::kGmmContext}))
        << seed;
  }
}

TEST(SimulatedDrive, TheFirstTwoMinutesAreLteAlone) {
  for (const std::uint64_t seed : kSeeds) {
    const auto seen = metricsOf(drive(seed), 120'000);
    for (const std::uint32_t other : {metric::kUmtsCellInfo, metric::kUmtsRrcState,
                                      metric::kGsmScellInfo, metric::kGsmNeighbours}) {
      EXPECT_FALSE(seen.contains(other)) << other << ", seed " << seed;
    }
  }
}

struct ListOfMetric {
  std::uint32_t metric;
  const char* key;
};

TEST(SimulatedDrive, TenMinutesFillEveryList) {
  const ListOfMetric lists[] = {
      {metric::kLteSelRes, "nbr_eutra"},
      {metric::kLteRsrpRsrqSinr, "inst_values"},
      {metric::kLteTxPower, "tx_power_info"},
      {metric::kLteNeighbours, "meas_nbr_eutra"},
      {metric::kLteInterRat, "meas_nbr_utra"},
      {metric::kLteInterRat, "meas_nbr_geran"},
      {metric::kLteCarrierAggregation, "scc_list"},
      {metric::kLteServingMeasurement, "rx_info"},
      {metric::kEmmContext, "tai_list"},
      {metric::kMmCommonInfo, "eplmn_list"},
      {metric::kBearers, "bearer_contexts"},
      {metric::kUmtsServingMeasurement, "rx_info"},
      {metric::kUmtsTxPower, "tx_power_info"},
      {metric::kUmtsSelRes, "eutra_prio_info"},
      {metric::kUmtsSelRes, "utra_prio_info"},
      {metric::kUmtsSelRes, "gsm_prio_info"},
      {metric::kUmtsNeighbours, "meas_utra_result"},
      {metric::kUmtsNeighbours, "meas_gsm_result"},
      {metric::kUmtsNeighbours, "meas_lte_result"},
      {metric::kGsmNeighbours, "gsm_ncell_meas"},
      {metric::kGsmNeighbours, "umts_ncell_meas"},
      {metric::kGsmNeighbours, "lte_ncell_meas"},
  };
  for (const std::uint64_t seed : kSeeds) {
    for (const ListOfMetric& list : lists) {
      std::size_t longest = 0;
      for (const DriveEvent& event : driveOf(seed, list.metric)) {
        longest = std::max(longest, entriesOf(event.message, list.key).size());
      }
      EXPECT_GE(longest, 1U) << list.key << " of " << list.metric << ", seed " << seed;
    }
  }
}

TEST(SimulatedDrive, ListsThatScreensIndexAreNeverEmpty) {
  for (const ListOfMetric& list : {ListOfMetric{metric::kLteRsrpRsrqSinr, "inst_values"},
                                   ListOfMetric{metric::kLteTxPower, "tx_power_info"},
                                   ListOfMetric{metric::kLteServingMeasurement, "rx_info"},
                                   ListOfMetric{metric::kUmtsServingMeasurement, "rx_info"},
                                   ListOfMetric{metric::kUmtsTxPower, "tx_power_info"},
                                   ListOfMetric{metric::kBearers, "bearer_contexts"},
                                   ListOfMetric{metric::kLteSelRes, "nbr_eutra"}}) {
    for (const DriveEvent& event : driveOf(1, list.metric)) {
      ASSERT_FALSE(entriesOf(event.message, list.key).empty()) << list.key;
    }
  }
}

TEST(SimulatedDrive, TheFieldThatNoReaderCanReadIsNotSent) {
  // 19 is a metric identifier; a receiver would log each time that it takes the field for one.
  for (const std::uint32_t kind : {metric::kLteSelRes, metric::kGsmIdleConfig}) {
    for (const DriveEvent& event : driveOf(1, kind)) {
      const Bytes& payload = *event.raw.entries.find(tesk::kKeyPayload)->asBytes();
      const auto message = findMetricMessage(kind)->decode(payload);
      EXPECT_EQ(message->data(), payload) << "something was not read";
    }
  }
}

TEST(SimulatedDrive, GoesThroughAllTechnologiesAndBackToLte) {
  for (const std::uint64_t seed : kSeeds) {
    const auto umts = driveOf(seed, metric::kUmtsCellInfo);
    const auto gsm = driveOf(seed, metric::kGsmScellInfo);
    const auto lte = driveOf(seed, metric::kLteScellInfo);
    ASSERT_FALSE(umts.empty());
    ASSERT_FALSE(gsm.empty());
    EXPECT_LT(umts.front().elapsedMs, gsm.front().elapsedMs);
    EXPECT_GT(lte.back().elapsedMs, gsm.back().elapsedMs);
  }
}

TEST(SimulatedDrive, HasNoEndAndStaysSound) {
  // There and back and there again: the whole of a cycle, and some.
  const auto& events = drive(3, 1'500'000);
  EXPECT_GT(events.back().elapsedMs, 1'499'000U);
  const auto seen = metricsOf(events, 1'500'000);
  EXPECT_EQ(seen.size(), KBBMetricUtility::catalogue().size() - 1);
}

TEST(SimulatedDrive, TriggersAnnounceWhatFollows) {
  std::set<std::int64_t> seen;
  for (const DriveEvent& event : drive(1)) {
    if (event.trigger != 0) seen.insert(event.trigger);
  }
  for (const Trigger trigger :
       {Trigger::cellChange, Trigger::handover, Trigger::technologyChange, Trigger::connectionSetUp,
        Trigger::connectionReleased, Trigger::radioLinkFailure, Trigger::registered,
        Trigger::carriersChanged}) {
    EXPECT_TRUE(seen.contains(static_cast<std::int64_t>(trigger)));
  }
}

TEST(SimulatedDrive, AnswersAQueryWithTheMetricAsItIs) {
  SimulatedDrive drive(1, kDriveStartMs);
  for (int i = 0; i < 300; ++i) drive.next();
  const SourceAnswer answer = drive.query(metric::kLteScellInfo);
  ASSERT_TRUE(answer.known);
  EXPECT_EQ(integerOf(answer.entries, tesk::kKeyMetricID), 0x3C0000 + metric::kLteScellInfo);
  const auto message = findMetricMessage(metric::kLteScellInfo)
                           ->decode(*answer.entries.find(tesk::kKeyPayload)->asBytes());
  EXPECT_EQ(integerOf(message->dictionaryRepresentation(), "phy_cell_id"),
            std::int64_t{drive.phone().serving().code});
}

TEST(SimulatedDrive, RefusesAQueryForWhatIsNotMeasuredNow) {
  SimulatedDrive drive(1, kDriveStartMs);
  for (const std::uint32_t metric :
       {metric::kGsmScellInfo, metric::kUmtsCellInfo, metric::kLteRadioLinkFailure, 4711U}) {
    const SourceAnswer answer = drive.query(metric);
    EXPECT_FALSE(answer.known);
    EXPECT_EQ(answer.message, "metric " + std::to_string(metric) + " has no value at the moment");
  }
}

TEST(SimulatedDrive, AQueryDoesNotChangeTheDrive) {
  SimulatedDrive asked(1, kDriveStartMs);
  SimulatedDrive left(1, kDriveStartMs);
  for (int i = 0; i < 1000; ++i) {
    asked.query(metric::kLteRsrpRsrqSinr);
    asked.query(metric::kSimFiles);
    ASSERT_EQ(asked.next()->entries, left.next()->entries);
  }
}

}  // namespace
}  // namespace qel
