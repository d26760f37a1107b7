#include "ui/quick/TableModel.h"

#include <gtest/gtest.h>

#include <QtTest/QAbstractItemModelTester>

#include "ui/Tables.h"

namespace qel {
namespace {

using Strings = std::vector<std::string>;

// Writes down what a model tells its views.
class ModelLog {
 public:
  explicit ModelLog(TableModel& model) {
    QObject::connect(&model, &TableModel::rowsInserted,
                     [this](const QModelIndex&, int first, int last) { add("in", first, last); });
    QObject::connect(&model, &TableModel::rowsRemoved,
                     [this](const QModelIndex&, int first, int last) { add("out", first, last); });
    QObject::connect(&model, &TableModel::dataChanged,
                     [this](const QModelIndex& first, const QModelIndex& last) {
                       add("changed", first.row(), last.row());
                     });
    QObject::connect(&model, &TableModel::modelReset, [this] { lines.emplace_back("reset"); });
  }

  Strings take() { return std::exchange(lines, {}); }

 private:
  void add(const std::string& what, int first, int last) {
    lines.push_back(what + " " + std::to_string(first) + "-" + std::to_string(last));
  }

  Strings lines;
};

class TableModelTest : public ::testing::Test {
 protected:
  TableModelTest() {
    table->setTitle("Tx Power");
    table->sections = {{"A 0", {{"rsrp", "-86"}, {"rsrq", "-14.5"}}}, {"A 1", {{"rsrp", "-90"}}}};
  }

  TableModel& model() {
    if (!_model) {
      _model = std::make_unique<TableModel>(table, "LTE", nullptr);
      _tester = std::make_unique<QAbstractItemModelTester>(
          _model.get(), QAbstractItemModelTester::FailureReportingMode::Fatal);
    }
    return *_model;
  }

  std::string at(int row, int role) {
    return model().data(model().index(row), role).toString().toStdString();
  }

  std::shared_ptr<testing::FakeTable> table = testing::makeScreen<testing::FakeTable>();

 private:
  std::unique_ptr<TableModel> _model;
  std::unique_ptr<QAbstractItemModelTester> _tester;
};

TEST_F(TableModelTest, showsEveryRowUnderItsSection) {
  EXPECT_EQ(model().rowCount(), 3);
  EXPECT_EQ(model().title(), "Tx Power");
  EXPECT_EQ(model().previousTitle(), "LTE");
  EXPECT_EQ(model().cellIdentifier(), "SecondClickView");
  EXPECT_EQ(at(1, TableModel::sectionTitleRole), "A 0");
  EXPECT_EQ(at(2, TableModel::sectionTitleRole), "A 1");
  EXPECT_EQ(at(1, TableModel::textRole), "rsrq");
  EXPECT_EQ(at(1, TableModel::detailRole), "-14.5");
  EXPECT_EQ(at(1, TableModel::changesRole), "0");
  EXPECT_FALSE(model().isBlank());
}

TEST_F(TableModelTest, aReloadWithoutChangeSaysNothing) {
  ModelLog log(model());
  table->tableView()->reloadData();
  EXPECT_EQ(log.take(), Strings{});
}

TEST_F(TableModelTest, onlyTheRowThatChangedIsAnnounced) {
  ModelLog log(model());
  table->sections[0].rows[1].second = "-15.0";
  table->tableView()->reloadData();
  EXPECT_EQ(log.take(), Strings{"changed 1-1"});
  EXPECT_EQ(at(1, TableModel::detailRole), "-15.0");
  EXPECT_EQ(at(1, TableModel::changesRole), "1");
  EXPECT_EQ(at(0, TableModel::changesRole), "0");
}

TEST_F(TableModelTest, aSectionThatComesOrGoesLeavesTheOthersAlone) {
  ModelLog log(model());
  table->sections.push_back({"A 2", {{"rsrp", "-99"}, {"rsrq", "-9.0"}}});
  table->tableView()->reloadData();
  EXPECT_EQ(log.take(), Strings{"in 3-4"});
  table->sections.erase(table->sections.begin() + 1, table->sections.end());
  table->tableView()->reloadData();
  EXPECT_EQ(log.take(), Strings{"out 2-4"});
}

TEST_F(TableModelTest, aFieldThatComesIsPutInItsPlace) {
  ModelLog log(model());
  auto& rows = table->sections[0].rows;
  rows.insert(rows.begin() + 1, {"sinr", "12"});
  table->tableView()->reloadData();
  EXPECT_EQ(log.take(), Strings{"in 1-1"});
  EXPECT_EQ(at(1, TableModel::textRole), "sinr");
}

TEST_F(TableModelTest, fieldsThatChangePlacesAreMovedNotRewritten) {
  ModelLog log(model());
  std::swap(table->sections[0].rows[0], table->sections[0].rows[1]);
  table->tableView()->reloadData();
  EXPECT_EQ(log.take().size(), 2U) << "one row out, one row in";
  EXPECT_EQ(at(0, TableModel::textRole), "rsrq");
  EXPECT_EQ(at(0, TableModel::detailRole), "-14.5");
}

TEST_F(TableModelTest, aTextThatIsItsOwnValueIsANotice) {
  table->sections = {{"A 0", {{"Waiting for Update", "Waiting for Update"}, {"a", "b"}}}};
  EXPECT_EQ(at(0, TableModel::noticeRole), "true");
  EXPECT_EQ(at(1, TableModel::noticeRole), "false");
}

TEST_F(TableModelTest, aFieldThatIsCalledLikeItsValueIsNoNotice) {
  table->sections = {{"PDP 0", {{"apn", "apn"}, {"Come back later", "Come back later"}}}};
  EXPECT_EQ(at(0, TableModel::noticeRole), "false");
  EXPECT_EQ(at(1, TableModel::noticeRole), "true");
}

// A table whose sections may be empty.
class SectionedTable final : public testing::FakeTable {
 public:
  std::string_view cellOfEmptySection() const override { return "SecondClickView"; }
};

TEST_F(TableModelTest, aSectionWithoutFieldsKeepsItsTitle) {
  table = testing::makeScreen<SectionedTable>();
  table->sections = {{"LTE 0", {}}, {"LTE 1", {{"rsrp", "-86"}}}, {std::nullopt, {}}};
  ASSERT_EQ(model().rowCount(), 2);
  EXPECT_EQ(at(0, TableModel::sectionTitleRole), "LTE 0");
  EXPECT_EQ(at(0, TableModel::textRole), "");
  EXPECT_EQ(at(0, TableModel::detailRole), "");
  EXPECT_EQ(at(0, TableModel::noticeRole), "false");
  EXPECT_EQ(at(1, TableModel::sectionTitleRole), "LTE 1");

  ModelLog log(model());
  table->sections[0].rows = {{"rsrp", "-99"}};
  table->tableView()->reloadData();
  EXPECT_EQ(log.take(), (Strings{"out 0-0", "in 0-0"}));
  EXPECT_EQ(at(0, TableModel::textRole), "rsrp");
}

TEST_F(TableModelTest, aTableOfSectionsWithoutFieldsIsNotBlank) {
  table = testing::makeScreen<SectionedTable>();
  table->sections = {{"LTE 0", {}}};
  EXPECT_FALSE(model().isBlank());
  EXPECT_EQ(model().cellIdentifier(), "SecondClickView");
  std::vector<IndexPath> chosen;
  QObject::connect(&model(), &TableModel::chosen,
                   [&chosen](IndexPath indexPath) { chosen.push_back(indexPath); });
  model().choose(0);
  EXPECT_TRUE(chosen.empty()) << "there is no field to open";
}

TEST_F(TableModelTest, withoutAnyTextIsBlank) {
  table->sections.clear();
  EXPECT_TRUE(model().isBlank());
  EXPECT_EQ(model().rowCount(), 0);
  table->sections = {{std::nullopt, {{"a", "b"}}}};
  table->tableView()->reloadData();
  EXPECT_FALSE(model().isBlank());
}

TEST_F(TableModelTest, tellsWhichRowWasChosen) {
  std::vector<IndexPath> chosen;
  QObject::connect(&model(), &TableModel::chosen,
                   [&chosen](IndexPath indexPath) { chosen.push_back(indexPath); });
  model().choose(2);
  model().choose(3);
  model().choose(-1);
  EXPECT_EQ(chosen, (std::vector<IndexPath>{{1, 0}}));
}

TEST_F(TableModelTest, aTableWhoseModelIsGoneIsNotDrawn) {
  { const TableModel gone(table, "", nullptr); }
  table->calls.clear();
  table->tableView()->reloadData();
  EXPECT_TRUE(table->calls.empty());
}

}  // namespace
}  // namespace qel
