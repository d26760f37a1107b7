#include "ui/kit/TableView.h"

#include <gtest/gtest.h>

#include "ui/Tables.h"

namespace qel {
namespace {

TableView tableWithPrototype() {
  TableView table;
  table.registerPrototype(TableViewCell("Field", Label{"name"}, Label{}));
  return table;
}

TEST(TableView, dequeuesAFreshCopyOfThePrototypeForANewRow) {
  TableView table = tableWithPrototype();
  const TableViewCell& cell = table.dequeueReusableCellWithIdentifier("Field", {0, 0});
  EXPECT_EQ(cell.identifier, "Field");
  EXPECT_EQ(cell.textLabel->text, "name");
  ASSERT_TRUE(cell.detailTextLabel);
  EXPECT_FALSE(cell.detailTextLabel->text);
}

TEST(TableView, aDequeuedCellKeepsWhatItsRowShowedBefore) {
  TableView table = tableWithPrototype();
  table.dequeueReusableCellWithIdentifier("Field", {1, 2}).detailTextLabel->text = "-86";
  EXPECT_EQ(table.dequeueReusableCellWithIdentifier("Field", {1, 2}).detailTextLabel->text, "-86");
  EXPECT_FALSE(table.dequeueReusableCellWithIdentifier("Field", {2, 1}).detailTextLabel->text);
}

TEST(TableView, anotherPrototypeForTheSameRowStartsAfresh) {
  TableView table = tableWithPrototype();
  table.registerPrototype(TableViewCell("Other", std::nullopt, std::nullopt));
  table.dequeueReusableCellWithIdentifier("Field", {0, 0}).textLabel->text = "rsrp";
  EXPECT_FALSE(table.dequeueReusableCellWithIdentifier("Other", {0, 0}).textLabel);
}

TEST(TableViewDeathTest, anUnknownIdentifierIsFatal) {
  TableView table = tableWithPrototype();
  EXPECT_DEATH(table.dequeueReusableCellWithIdentifier("Nowhere", {0, 0}),
               "no cell prototype with identifier Nowhere");
}

TEST(TableView, knowsOnlyCellsThatWereDrawn) {
  TableView table = tableWithPrototype();
  EXPECT_EQ(table.cellForRowAtIndexPath({0, 0}), nullptr);
  const TableViewCell& drawn = table.dequeueReusableCellWithIdentifier("Field", {0, 0});
  EXPECT_EQ(table.cellForRowAtIndexPath({0, 0}), &drawn);
}

TEST(TableView, tellsItsFaceOnceUntilItHasDrawn) {
  TableView table;
  int told = 0;
  table.setFace([&told] { ++told; });
  EXPECT_EQ(told, 1) << "a new table has everything to draw";
  table.reloadData();
  EXPECT_EQ(told, 1) << "it was told already";
  table.drawn();
  table.reloadData();
  EXPECT_EQ(told, 2);
}

TEST(TableView, withoutFaceAReloadOnlyMarksIt) {
  TableView table;
  table.drawn();
  for (int i = 0; i < 1000; ++i) table.reloadData();
  EXPECT_TRUE(table.needsDrawing());
  int told = 0;
  table.setFace([&told] { ++told; });
  EXPECT_EQ(told, 1) << "the face that comes back catches up at once";
}

// Screens that were left kept the text of all their rows: some kilobytes each, for good.
TEST(TableView, forgetsItsCellsWithItsFace) {
  TableView table = tableWithPrototype();
  table.setFace([] {});
  table.dequeueReusableCellWithIdentifier("Field", {0, 0}).detailTextLabel->text = "-86";
  table.setFace({});
  EXPECT_EQ(table.cellForRowAtIndexPath({0, 0}), nullptr);
}

TEST(TableSnapshot, asksForEverythingOnceAndInOrder) {
  const auto table = testing::makeScreen<testing::FakeTable>();
  table->sections = {{"A", {{"x", "1"}, {"y", "2"}}}, {std::nullopt, {}}, {"C", {{"z", "3"}}}};
  const TableSnapshot snapshot = snapshotOf(*table);
  EXPECT_EQ(table->calls, (testing::Lines{"sections", "title 0", "rows 0", "cell 0,0", "cell 0,1",
                                          "title 1", "rows 1", "title 2", "rows 2", "cell 2,0"}));
  EXPECT_EQ(snapshot.sections.size(), 3U);
  EXPECT_EQ(testing::linesOf(snapshot), (testing::Lines{"A|x|1", "A|y|2", "C|z|3"}));
}

TEST(TableSnapshot, ofATableWithoutSectionsIsEmpty) {
  EXPECT_EQ(snapshotOf(*testing::makeScreen<testing::FakeTable>()), TableSnapshot{});
}

TEST(TableSnapshot, loadsTheViewThatWasNotLoadedYet) {
  const auto table = testing::makeScreen<testing::FakeTable>();
  EXPECT_FALSE(table->isViewLoaded());
  snapshotOf(*table);
  EXPECT_TRUE(table->isViewLoaded());
}

}  // namespace
}  // namespace qel
