#include <gtest/gtest.h>

#include "support/RecordingSink.h"
#include "ui/Tables.h"
#include "ui/screens/FirstLevelViewController.h"
#include "ui/screens/QelViewController.h"
#include "ui/screens/ThirdLevelViewController.h"

namespace qel {
namespace {

using testing::linesOf;
using testing::makeScreen;
using Strings = std::vector<std::string>;

const Strings kTechnologies = {"Device Info", "LTE", "UMTS", "GSM"};

Strings textsOf(TableViewController& menu) {
  Strings texts;
  for (const SectionSnapshot& section : snapshotOf(menu).sections) {
    for (const RowSnapshot& row : section.rows) texts.push_back(row.text.value_or("-"));
  }
  return texts;
}

TableViewCell chosenCell(std::optional<std::string> text) {
  return TableViewCell("FirstClickView", Label{std::move(text)}, std::nullopt);
}

class Menus : public ::testing::Test {
 protected:
  testing::CapturedSystemLog log;
  testing::CapturedStandardOutput out;
};

TEST(MenuCatalogue, namesFourTechnologiesInOrder) {
  EXPECT_EQ(QelViewItems().launchViewItemNames, kTechnologies);
}

TEST(MenuCatalogue, namesTheCategoriesOfEachInOrder) {
  const QelViewItems items;
  EXPECT_EQ(items.firstLevelViewItems.size(), 4U);
  EXPECT_EQ(items.firstLevelViewItems.at("Device Info"), (Strings{"IMSI", "IMEISV", "SIM Files"}));
  EXPECT_EQ(items.firstLevelViewItems.at("LTE"),
            (Strings{"NAS", "RRC State", "Serving Cell Info", "Serving Cell Meas", "Tx Power",
                     "Sel Resel Parameters", "EUTRA Neighbor Info", "C-DRX",
                     "LTE Neighbor Cell Meas", "UMTS Neighbor Cell Meas", "GSM Neighbor Cell Meas",
                     "CA Status", "Active Bearers"}));
  EXPECT_EQ(items.firstLevelViewItems.at("UMTS"),
            (Strings{"NAS GMM", "NAS MM", "RRC State", "RRC Configuration", "Serving Cell Info",
                     "Serving Cell Meas", "Tx Power", "Sel Resel Parameters", "EUTRA Neighbor Info",
                     "UTRA Neighbor Info", "GSM Neighbor Info", "LTE Neighbor Cell Meas",
                     "UMTS Neighbor Cell Meas", "GSM Neighbor Cell Meas", "Active Bearers"}));
  EXPECT_EQ(items.firstLevelViewItems.at("GSM"),
            (Strings{"NAS GMM", "NAS MM", "Serving Cell Info", "Idle Config", "Idle Serv Cell Meas",
                     "Connected Serv Cell Meas", "GSM GPRS Config", "LTE Neighbor Cell Meas",
                     "UMTS Neighbor Cell Meas", "GSM Neighbor Cell Meas", "Active Bearers"}));
}

TEST_F(Menus, theFirstShowsTheTechnologiesInOneSection) {
  const auto menu = makeScreen<QelViewController>();
  EXPECT_EQ(menu->numberOfSections(), 1);
  EXPECT_EQ(menu->numberOfRowsInSection(0), 4);
  EXPECT_EQ(menu->numberOfRowsInSection(7), 4) << "whatever the section";
  EXPECT_FALSE(menu->titleForHeaderInSection(0));
  EXPECT_EQ(textsOf(*menu), kTechnologies);
  EXPECT_EQ(menu->cellForRowAtIndexPath({0, 0}).identifier, "LaunchView");
}

TEST_F(Menus, aCellWithoutTextLabelStaysAsItIs) {
  const auto first = makeScreen<QelViewController>();
  first->tableView()->registerPrototype(TableViewCell("LaunchView", std::nullopt, std::nullopt));
  EXPECT_FALSE(first->cellForRowAtIndexPath({0, 99}).textLabel);
  const auto second = makeScreen<FirstLevelViewController>();
  second->tableView()->registerPrototype(
      TableViewCell("FirstClickView", std::nullopt, std::nullopt));
  EXPECT_FALSE(second->cellForRowAtIndexPath({0, 99}).textLabel);
}

TEST_F(Menus, choosingUMTSHandsItToTheCategoryMenu) {
  const auto destination = makeScreen<FirstLevelViewController>();
  const TableViewCell cell = chosenCell("UMTS");
  makeScreen<QelViewController>()->prepareForSegue({"any", destination}, &cell);
  EXPECT_EQ(destination->seguedThroughRow, "UMTS");
  EXPECT_EQ(textsOf(*destination).size(), 15U);
}

TEST_F(Menus, aTechnologyCellWithoutTextHandsNothingOver) {
  const auto destination = makeScreen<FirstLevelViewController>();
  destination->seguedThroughRow = "LTE";
  const TableViewCell cell = chosenCell(std::nullopt);
  makeScreen<QelViewController>()->prepareForSegue({"any", destination}, &cell);
  EXPECT_FALSE(destination->seguedThroughRow);
}

TEST_F(Menus, aSegueFromAnythingButACellLeavesTheDestinationUntouched) {
  const auto categories = makeScreen<FirstLevelViewController>();
  const auto fields = makeScreen<SecondLevelViewController>();
  const Sender button;
  for (const Sender* sender : {&button, static_cast<const Sender*>(nullptr)}) {
    makeScreen<QelViewController>()->prepareForSegue({"any", categories}, sender);
    makeScreen<FirstLevelViewController>()->prepareForSegue({"any", fields}, sender);
  }
  EXPECT_FALSE(categories->seguedThroughRow);
  EXPECT_FALSE(fields->firstSelection);
  EXPECT_FALSE(fields->seguedThroughRow);
}

TEST_F(Menus, aSegueToAnotherKindOfScreenLeavesItUntouched) {
  const auto other = makeScreen<ThirdLevelViewController>();
  const auto fields = makeScreen<SecondLevelViewController>();
  // Neither menu looks at the label before it knows the destination.
  const TableViewCell cell("LaunchView", std::nullopt, std::nullopt);
  makeScreen<QelViewController>()->prepareForSegue({"any", fields}, &cell);
  makeScreen<QelViewController>()->prepareForSegue({"any", nullptr}, &cell);
  makeScreen<FirstLevelViewController>()->prepareForSegue({"any", other}, &cell);
  EXPECT_FALSE(fields->seguedThroughRow);
  EXPECT_FALSE(other->seguedThroughRow);
}

TEST_F(Menus, deviceInfoListsThreeCategoriesInOneSection) {
  const auto menu = makeScreen<FirstLevelViewController>();
  menu->seguedThroughRow = "Device Info";
  EXPECT_EQ(menu->numberOfSections(), 1);
  EXPECT_EQ(menu->numberOfRowsInSection(3), 3) << "whatever the section";
  EXPECT_EQ(textsOf(*menu), (Strings{"IMSI", "IMEISV", "SIM Files"}));
  EXPECT_EQ(menu->cellForRowAtIndexPath({0, 0}).identifier, "FirstClickView");
}

TEST_F(Menus, choosingTxPowerUnderLTEOpensItsTable) {
  const auto menu = makeScreen<FirstLevelViewController>();
  menu->seguedThroughRow = "LTE";
  const auto destination = makeScreen<SecondLevelViewController>();
  const TableViewCell cell = chosenCell("Tx Power");
  menu->prepareForSegue({"any", destination}, &cell);
  EXPECT_EQ(destination->firstSelection, "LTE");
  EXPECT_EQ(destination->seguedThroughRow, "Tx Power");
}

TEST_F(Menus, theTechnologyIsPassedOnEvenWithoutACategory) {
  const auto menu = makeScreen<FirstLevelViewController>();
  menu->seguedThroughRow = "LTE";
  const auto destination = makeScreen<SecondLevelViewController>();
  destination->seguedThroughRow = "NAS";
  const TableViewCell cell = chosenCell(std::nullopt);
  menu->prepareForSegue({"any", destination}, &cell);
  EXPECT_EQ(destination->firstSelection, "LTE");
  EXPECT_FALSE(destination->seguedThroughRow);
}

TEST_F(Menus, allTakeTheOneDispatcher) {
  EXPECT_EQ(makeScreen<FirstLevelViewController>()->myMetricValidator, MetricValidator::shared());
  EXPECT_EQ(makeScreen<SecondLevelViewController>()->myMetricValidator, MetricValidator::shared());
}

using MenusDeathTest = Menus;

TEST_F(MenusDeathTest, aRowOutsideTheMenuIsFatal) {
  const auto first = makeScreen<QelViewController>();
  EXPECT_DEATH(first->cellForRowAtIndexPath({0, 4}), "row of the technology menu 4 of 4");
  EXPECT_DEATH(first->cellForRowAtIndexPath({0, -1}), "row of the technology menu -1 of 4");
  const auto second = makeScreen<FirstLevelViewController>();
  second->seguedThroughRow = "Device Info";
  EXPECT_DEATH(second->cellForRowAtIndexPath({0, 3}), "row of the category menu 3 of 3");
}

TEST_F(MenusDeathTest, aCategoryMenuWithoutKnownTechnologyIsFatal) {
  const auto menu = makeScreen<FirstLevelViewController>();
  EXPECT_DEATH(menu->numberOfRowsInSection(0), "without a technology");
  EXPECT_DEATH(menu->cellForRowAtIndexPath({0, 0}), "without a technology");
  menu->seguedThroughRow = "5G";
  EXPECT_DEATH(menu->numberOfRowsInSection(0), "unknown technology: 5G");
}

TEST_F(MenusDeathTest, aChosenCellWithoutTextLabelIsFatal) {
  const TableViewCell cell("FirstClickView", std::nullopt, std::nullopt);
  const auto first = makeScreen<QelViewController>();
  EXPECT_DEATH(first->prepareForSegue({"any", makeScreen<FirstLevelViewController>()}, &cell),
               "no text label");
  const auto second = makeScreen<FirstLevelViewController>();
  EXPECT_DEATH(second->prepareForSegue({"any", makeScreen<SecondLevelViewController>()}, &cell),
               "no text label");
}

TEST_F(Menus, theDetailScreenShowsOneEmptyCellWhateverWasSelected) {
  const auto detail = makeScreen<ThirdLevelViewController>();
  EXPECT_EQ(linesOf(snapshotOf(*detail)), Strings{"-|-|-"});
  detail->firstSelection = "LTE";
  detail->secondSelection = "Tx Power";
  detail->seguedThroughRow = "timestamp";
  EXPECT_EQ(detail->numberOfSections(), 1);
  EXPECT_EQ(detail->numberOfRowsInSection(5), 1);
  EXPECT_EQ(linesOf(snapshotOf(*detail)), Strings{"-|-|-"});
  EXPECT_EQ(detail->cellForRowAtIndexPath({0, 0}).identifier, "ThirdClickView");
}

TEST_F(Menus, theDetailScreenSetsNoTextWhereItsCellHasLabels) {
  const auto detail = makeScreen<ThirdLevelViewController>();
  detail->tableView()->registerPrototype(TableViewCell("ThirdClickView", Label{}, Label{}));
  EXPECT_EQ(linesOf(snapshotOf(*detail)), Strings{"-|-|-"});
}

TEST_F(MenusDeathTest, theDetailScreenNeedsItsPrototype) {
  const auto detail = std::make_shared<ThirdLevelViewController>();
  detail->setTableView(std::make_shared<TableView>());
  EXPECT_DEATH(detail->cellForRowAtIndexPath({0, 0}), "ThirdClickView");
}

TEST(StandardScreens, areMadeByClassNameWithTheirPrototypes) {
  const testing::CapturedSystemLog log;
  for (const char* name : {"QelViewController", "FirstLevelViewController",
                           "SecondLevelViewController", "ThirdLevelViewController"}) {
    const auto screen = makeStandardScreen(name);
    ASSERT_TRUE(screen) << name;
    EXPECT_FALSE(screen->isViewLoaded());
    const TableViewCell& cell =
        screen->tableView()->dequeueReusableCellWithIdentifier("SecondClickView", {0, 0});
    EXPECT_TRUE(cell.textLabel && cell.detailTextLabel);
  }
  EXPECT_EQ(makeStandardScreen("FourthLevelViewController"), nullptr);
}

}  // namespace
}  // namespace qel
