#include <gtest/gtest.h>

#include "base/DispatchQueue.h"
#include "support/RecordingSink.h"
#include "ui/Tables.h"
#include "ui/kit/RunLoop.h"

namespace qel {
namespace {

using std::chrono::seconds;
using testing::categoryTable;

// Fires the main run loop's next wake-up, whenever that is. When it was due.
RunLoop::TimePoint fireNext() {
  const auto due = RunLoop::main().nextDue();
  if (!due) return {};
  RunLoop::main().fireDue(*due);
  return *due;
}

class CategoryRefresh : public ::testing::Test {
 protected:
  void showFace(TableView& tableView) {
    tableView.setFace([this, &tableView] {
      ++draws;
      tableView.drawn();
    });
    draws = 0;
  }

  testing::CapturedSystemLog log;
  testing::CapturedStandardOutput out;
  int draws = 0;
};

TEST_F(CategoryRefresh, startsWhenTheViewIsLoaded) {
  const auto table = categoryTable("LTE", "NAS");
  EXPECT_FALSE(RunLoop::main().nextDue());
  const auto before = std::chrono::steady_clock::now();
  table->loadViewIfNeeded();
  const auto after = std::chrono::steady_clock::now();
  ASSERT_TRUE(RunLoop::main().nextDue());
  EXPECT_GE(*RunLoop::main().nextDue(), before + seconds(5));
  EXPECT_LE(*RunLoop::main().nextDue(), after + seconds(5));
}

TEST_F(CategoryRefresh, redrawsEveryFiveSecondsThroughTheMainQueue) {
  const auto table = categoryTable("LTE", "NAS");
  table->loadViewIfNeeded();
  showFace(*table->tableView());
  const auto first = fireNext();
  EXPECT_EQ(draws, 0) << "the timer only posts the redraw";
  MainQueue::shared().drain();
  EXPECT_EQ(draws, 1);
  EXPECT_EQ(fireNext(), first + seconds(5));
  MainQueue::shared().drain();
  EXPECT_EQ(draws, 2);
}

TEST_F(CategoryRefresh, aScreenThatWasLeftLivesOn) {
  std::weak_ptr<SecondLevelViewController> left;
  {
    const auto table = categoryTable("LTE", "NAS");
    table->loadViewIfNeeded();
    left = table;
  }
  ASSERT_FALSE(left.expired());
  left.lock()->tableView()->drawn();
  fireNext();
  MainQueue::shared().drain();
  EXPECT_TRUE(left.lock()->tableView()->needsDrawing()) << "it keeps redrawing";
}

TEST_F(CategoryRefresh, everyVisitStartsATimerOfItsOwn) {
  for (int visit = 0; visit < 3; ++visit) {
    const auto table = categoryTable("LTE", "NAS");
    table->loadViewIfNeeded();
    showFace(*table->tableView());
  }
  draws = 0;
  fireNext();
  MainQueue::shared().drain();
  EXPECT_EQ(draws, 3);
}

TEST_F(CategoryRefresh, aThousandScreensThatWereLeftShareOneWakeUpAndDrawNothing) {
  for (int visit = 0; visit < 1000; ++visit) {
    categoryTable("LTE", "Serving Cell Info")->loadViewIfNeeded();
  }
  const auto first = fireNext();
  MainQueue::shared().drain();
  EXPECT_GE(fireNext(), first + seconds(5));
  EXPECT_TRUE(out.lines().empty()) << "drawing this category would have printed a line";
}

TEST_F(CategoryRefresh, theDetailScreenNeverRedraws) {
  makeStandardScreen("ThirdLevelViewController")->loadViewIfNeeded();
  makeStandardScreen("QelViewController")->loadViewIfNeeded();
  makeStandardScreen("FirstLevelViewController")->loadViewIfNeeded();
  EXPECT_FALSE(RunLoop::main().nextDue());
}

using CategoryRefreshDeathTest = CategoryRefresh;

TEST_F(CategoryRefreshDeathTest, aScreenWithoutTableIsFatalWhenTheRedrawRuns) {
  const auto table = categoryTable("LTE", "NAS");
  table->setTableView(nullptr);
  table->update();
  EXPECT_DEATH(MainQueue::shared().drain(), "has no table view");
}

}  // namespace
}  // namespace qel
