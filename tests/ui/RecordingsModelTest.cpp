// The list of recordings as the window keeps it.

#include "ui/quick/pages/RecordingsModel.h"

#include <gtest/gtest.h>

#include <QtTest/QTest>

#include "support/RecordedLines.h"

namespace qel::testing {
namespace {

class RecordingsModelTest : public ::testing::Test {
 protected:
  RecordingsModelTest() {
    ::setenv("XDG_DATA_HOME", data.path().c_str(), 1);
    std::filesystem::create_directories(RecordingsFolder::usualPath());
    data.file("qelwatch/recordings/drive.jsonl",
              lineOf(lteCell(1'500'000'000'000, 1)) + lineOf(lteCell(1'500'000'754'000, 2)));
  }

  static QString cellsOfFirst(RecordingsModel& model) {
    const QModelIndex first = model.rows()->index(0);
    return first.data(RowsModel::rowRole).toMap()["cells"].toString();
  }
  static bool comesToShowTwoCells(RecordingsModel& model) {
    return QTest::qWaitFor([&model] { return cellsOfFirst(model) == "2 cells"; });
  }

  const TemporaryFolder data;
};

TEST_F(RecordingsModelTest, readsWhatIsInARecordingByItself) {
  RecordingsModel model;
  model.enter("");
  EXPECT_EQ(cellsOfFirst(model), "") << "not known yet";
  EXPECT_TRUE(comesToShowTwoCells(model));
}

TEST_F(RecordingsModelTest, readsADeletedRecordingAgainThatIsBack) {
  RecordingsModel model;
  model.enter("");
  ASSERT_TRUE(comesToShowTwoCells(model));
  model.remove("drive.jsonl");
  EXPECT_EQ(model.rows()->count(), 0);
  EXPECT_EQ(model.undoText(), "drive.jsonl deleted");
  QTest::qWait(50);  // whatever was under way ends
  model.undo();
  EXPECT_EQ(model.rows()->count(), 1);
  EXPECT_EQ(model.undoText(), "");
  EXPECT_TRUE(comesToShowTwoCells(model));
}

TEST_F(RecordingsModelTest, hasNoUndoOnceThePageWasLeft) {
  RecordingsModel model;
  model.enter("");
  model.remove("drive.jsonl");
  model.leave();
  model.undo();
  EXPECT_EQ(model.rows()->count(), 0);
  EXPECT_FALSE(data.has("qelwatch/recordings/.drive.jsonl.deleted"));
}

}  // namespace
}  // namespace qel::testing
