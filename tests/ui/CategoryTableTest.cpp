#include <gtest/gtest.h>

#include "support/RecordingSink.h"
#include "ui/Tables.h"

namespace qel {
namespace {

using testing::categoryTable;
using testing::Lines;
using testing::linesOf;

class CategoryTables : public ::testing::Test {
 protected:
  Lines linesOfTable(const std::string& technology, const std::string& category) {
    return linesOf(snapshotOf(*categoryTable(technology, category)));
  }

  testing::CapturedSystemLog log;
  testing::CapturedStandardOutput out;
  MetricValidator& store = *MetricValidator::shared();
};

const Lines kComeBackLater = {"-|Come back later|Come back later"};

TEST_F(CategoryTables, showAFieldARowInTheOrderOfTheRecord) {
  store.myLTERRCStateDict = {{"timestamp", "2017-07-14 02:40:00 UTC"},
                             {"rrc_state", "KLTE_RRC_STATE_CONNECTED"}};
  EXPECT_EQ(linesOfTable("LTE", "RRC State"),
            (Lines{"-|timestamp|2017-07-14 02:40:00 UTC", "-|rrc_state|KLTE_RRC_STATE_CONNECTED"}));
}

TEST_F(CategoryTables, writeEveryKindOfValueAsText) {
  store.myLTECDRXConfigDict = {{"integer", -86},
                               {"float", -14.5F},
                               {"whole", 20.0F},
                               {"truth", true},
                               {"text", "10 MHz"},
                               {"bytes", Bytes{0x0A, 0xFF}},
                               {"list", List{1, 3, 7}},
                               {"record", Dictionary{{"tac", 1}}},
                               {"huge", std::uint64_t{18446744073709551615U}}};
  EXPECT_EQ(linesOfTable("LTE", "C-DRX"),
            (Lines{"-|integer|-86", "-|float|-14.5", "-|whole|20.0", "-|truth|1", "-|text|10 MHz",
                   "-|bytes|<0aff>", "-|list|[1, 3, 7]", "-|record|{\"tac\": 1}",
                   "-|huge|18446744073709551615"}));
}

TEST_F(CategoryTables, readTheStoreAfreshAtEveryDraw) {
  const auto table = categoryTable("LTE", "RRC State");
  store.myLTERRCStateDict = {{"a", 1}, {"b", 2}};
  EXPECT_EQ(linesOf(snapshotOf(*table)), (Lines{"-|a|1", "-|b|2"}));
  store.myLTERRCStateDict = {{"b", 3}, {"a", 4}};
  EXPECT_EQ(linesOf(snapshotOf(*table)), (Lines{"-|b|3", "-|a|4"})) << "rows may change places";
}

TEST_F(CategoryTables, withoutRecordShowOneRowWithoutText) {
  EXPECT_EQ(linesOfTable("LTE", "RRC State"), Lines{"-|-|-"});
  EXPECT_EQ(linesOfTable("UMTS", "NAS MM"), Lines{"-|-|-"});
  EXPECT_TRUE(out.lines().empty());
}

TEST_F(CategoryTables, withoutRecordAUsedCellKeepsWhatItShowed) {
  const auto table = categoryTable("LTE", "RRC State");
  store.myLTERRCStateDict = {{"a", 1}};
  snapshotOf(*table);
  store.myLTERRCStateDict.reset();
  EXPECT_EQ(linesOf(snapshotOf(*table)), Lines{"-|a|1"});
}

TEST_F(CategoryTables, sayYouAreScrewedForTheServingCellOnly) {
  const auto table = categoryTable("LTE", "Serving Cell Info");
  EXPECT_EQ(table->numberOfRowsInSection(0), 1);
  EXPECT_EQ(out.lines(), Lines{"You are screwed"});
  snapshotOf(*table);
  EXPECT_EQ(out.lines().size(), 2U) << "once a draw";
  store.myLTESCellInfoDict = {{"pci", 1}, {"earfcn", 2}};
  EXPECT_EQ(table->numberOfRowsInSection(0), 2);
  linesOfTable("UMTS", "Serving Cell Info");
  EXPECT_EQ(out.lines().size(), 2U);
}

TEST_F(CategoryTables, ofAListHaveASectionForEachEntry) {
  store.myLTE.EutraNbrs = {{{"earfcn", 100}}, {{"earfcn", 200}, {"pci", 2}}, {{"earfcn", 300}}};
  const auto table = categoryTable("LTE", "EUTRA Neighbor Info");
  EXPECT_EQ(table->numberOfSections(), 3);
  EXPECT_EQ(linesOf(snapshotOf(*table)),
            (Lines{"EUTRA Neighbor 0|earfcn|100", "EUTRA Neighbor 1|earfcn|200",
                   "EUTRA Neighbor 1|pci|2", "EUTRA Neighbor 2|earfcn|300"}));
}

TEST_F(CategoryTables, ofAnEmptyListHaveNoSections) {
  store.myLTE.CAStatusList.clear();
  const auto table = categoryTable("LTE", "CA Status");
  EXPECT_EQ(table->numberOfSections(), 0);
  EXPECT_EQ(snapshotOf(*table), TableSnapshot{});
}

TEST_F(CategoryTables, ofAListThatWasNeverFilledShowThePlaceholder) {
  EXPECT_EQ(linesOfTable("LTE", "Tx Power"),
            Lines{"TxPowerInfo 0|Waiting for Update|Waiting for Update"});
  EXPECT_EQ(linesOfTable("Device Info", "SIM Files"),
            Lines{"SIM Content 0|Waiting for Update|Waiting for Update"});
}

TEST_F(CategoryTables, showAnEmptyEntryAsASectionWithoutRows) {
  store.myCommon.activeBearer = {{}, {{"apn", "internet"}}};
  const TableSnapshot snapshot = snapshotOf(*categoryTable("GSM", "Active Bearers"));
  ASSERT_EQ(snapshot.sections.size(), 2U);
  EXPECT_EQ(snapshot.sections[0].title, "PDP 0");
  EXPECT_TRUE(snapshot.sections[0].rows.empty());
}

TEST_F(CategoryTables, LTEServingCellMeasIsOneSectionOverTheFirstEntry) {
  store.myLTE.RsrpRsrqSinr = {{{"rsrp", -90}}, {{"rsrp", -80}}};
  const auto table = categoryTable("LTE", "Serving Cell Meas");
  EXPECT_EQ(table->numberOfSections(), 1);
  EXPECT_FALSE(table->titleForHeaderInSection(0));
  EXPECT_EQ(linesOf(snapshotOf(*table)), Lines{"-|rsrp|-90"});
}

TEST_F(CategoryTables, UMTSServingCellMeasHasSectionsButItsCellsComeBackLater) {
  store.myUMTS.rXInfo = {{{"rscp", -90}, {"ecno", -5}}, {{"rscp", -80}}};
  EXPECT_EQ(
      linesOfTable("UMTS", "Serving Cell Meas"),
      (Lines{"RxInfo 0|Come back later|Come back later", "RxInfo 0|Come back later|Come back later",
             "RxInfo 1|Come back later|Come back later"}));
}

TEST_F(CategoryTables, tellTheKeyWithTwoBlanksFromTheOneWithOne) {
  store.myGMMContextDict = {{"gmm", 1}};
  store.myMMContextDict = {{"mm", 2}};
  EXPECT_EQ(linesOfTable("GSM", "NAS  MM"), Lines{"-|gmm|1"});
  EXPECT_EQ(linesOfTable("GSM", "NAS MM"), Lines{"-|mm|2"});
  EXPECT_EQ(linesOfTable("UMTS", "NAS  MM"), kComeBackLater);
}

TEST_F(CategoryTables, compareKeysExactly) {
  store.myLTERRCStateDict = {{"a", 1}};
  EXPECT_EQ(linesOfTable("LTE", "rrc state"), kComeBackLater);
  EXPECT_EQ(linesOfTable("LTE ", "RRC State"), kComeBackLater);
  EXPECT_EQ(linesOfTable("LTE", "RRC State "), kComeBackLater);
  EXPECT_EQ(linesOfTable("LTE RRC", "State"), Lines{"-|a|1"}) << "only the joined key counts";
}

TEST_F(CategoryTables, ofMenuRowsThatNoRoutineKnowsComeBackLater) {
  store.myGSMGPRSConfigDict = {{"a", 1}};
  store.myGSMConnRfMeasDict = {{"a", 1}};
  store.myGMMContextDict = {{"a", 1}};
  EXPECT_EQ(linesOfTable("GSM", "GSM GPRS Config"), kComeBackLater);
  EXPECT_EQ(linesOfTable("GSM", "Connected Serv Cell Meas"), kComeBackLater);
  EXPECT_EQ(linesOfTable("GSM", "NAS GMM"), kComeBackLater);
  EXPECT_EQ(linesOfTable("Device Info", "IMSI"), kComeBackLater);
  EXPECT_EQ(linesOfTable("Device Info", "IMEISV"), kComeBackLater);
}

TEST_F(CategoryTables, withoutSelectionComeBackLater) {
  const auto table = testing::makeScreen<SecondLevelViewController>();
  EXPECT_EQ(linesOf(snapshotOf(*table)), kComeBackLater);
  table->firstSelection = "LTE";
  EXPECT_EQ(linesOf(snapshotOf(*table)), kComeBackLater);
}

TEST_F(CategoryTables, doNotKeepTheCellTheyFill) {
  const auto table = categoryTable("LTE", "NAS");
  snapshotOf(*table);
  EXPECT_FALSE(table->currentCell);
}

TEST_F(CategoryTables, leaveOutTheTextOfALabelThatTheCellLacks) {
  store.myLTERRCStateDict = {{"a", 1}};
  const auto table = categoryTable("LTE", "RRC State");
  table->tableView()->registerPrototype(TableViewCell("SecondClickView", Label{}, std::nullopt));
  EXPECT_EQ(linesOf(snapshotOf(*table)), Lines{"-|a|-"});
}

TEST_F(CategoryTables, letRowHeightsFollowTheContent) {
  const auto table = categoryTable("LTE", "NAS");
  EXPECT_EQ(table->heightForRowAtIndexPath({0, 0}), kAutomaticDimension);
  EXPECT_EQ(table->estimatedHeightForRowAtIndexPath({0, 0}), kAutomaticDimension);
}

using CategoryTablesDeathTest = CategoryTables;

TEST_F(CategoryTablesDeathTest, aSectionBeyondTheListIsFatal) {
  store.myLTE.EutraNbrs = {{{"earfcn", 100}}};
  const auto table = categoryTable("LTE", "EUTRA Neighbor Info");
  EXPECT_DEATH(table->numberOfRowsInSection(1), "section of LTE EUTRA Neighbor Info 1 of 1");
  EXPECT_DEATH(table->cellForRowAtIndexPath({1, 0}), "section of LTE EUTRA Neighbor Info 1 of 1");
  EXPECT_DEATH(table->numberOfRowsInSection(-1), "index out of range");
}

TEST_F(CategoryTablesDeathTest, aRowBeyondTheRecordIsFatal) {
  store.myLTERRCStateDict = {{"a", 1}};
  const auto table = categoryTable("LTE", "RRC State");
  EXPECT_DEATH(table->cellForRowAtIndexPath({0, 1}), "row of LTE RRC State 1 of 1");
  EXPECT_DEATH(table->cellForRowAtIndexPath({0, -1}), "row of LTE RRC State -1 of 1");
}

TEST_F(CategoryTablesDeathTest, anEmptyListOfMeasurementsIsFatalForItsOneSection) {
  store.myLTE.RsrpRsrqSinr.clear();
  const auto table = categoryTable("LTE", "Serving Cell Meas");
  EXPECT_DEATH(table->numberOfRowsInSection(0), "section of LTE Serving Cell Meas 0 of 0");
}

}  // namespace
}  // namespace qel
