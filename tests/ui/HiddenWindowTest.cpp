// A window that nobody can see: another screen is before it, or the device is locked.

#include <gtest/gtest.h>

#include <QtTest/QTest>

#include "ui/Reports.h"
#include "ui/Window.h"

namespace qel {
namespace {

using namespace testing;

class HiddenWindow : public ::testing::Test {
 protected:
  void SetUp() override {
    reportCell(123);
    reportLevel(-86);
    ASSERT_TRUE(comesToShow(window, "-86"));
    window.window().hide();
    ASSERT_TRUE(QTest::qWaitFor([this] { return !window.appearance().isSeen(); }));
    QObject::connect(&window.window(), &QQuickWindow::frameSwapped, &window.window(),
                     [this] { ++frames; });
    QObject::connect(window.navigation().pages()->now(), &NowModel::levelChanged, &window.window(),
                     [this] { ++levels; });
  }

  const Window window{true};
  int frames = 0;
  int levels = 0;
};

TEST_F(HiddenWindow, drawsNothingAndMakesNoPage) {
  reportLevel(-90);
  window.navigation().pages()->look();
  QTest::qWait(700);  // in which a page would have followed
  EXPECT_EQ(levels, 0);
  EXPECT_EQ(frames, 0);
}

TEST_F(HiddenWindow, showsWhatIsTheCaseWhenItIsSeenAgain) {
  reportLevel(-90);
  window.navigation().pages()->look();
  window.window().show();
  ASSERT_TRUE(QTest::qWaitFor([this] { return window.appearance().isSeen(); }));
  window.settle();
  EXPECT_TRUE(window.shows("-90"));
  EXPECT_EQ(levels, 1);
}

TEST_F(HiddenWindow, fadesNothing) {
  window.store().myLTERRCStateDict = {{"state", "before"}};
  window.top().choose(1);
  window.top().choose(1);
  window.store().myLTERRCStateDict = {{"state", "after"}};
  window.refresh();
  frames = 0;
  QTest::qWait(700);
  EXPECT_EQ(frames, 0);
}

}  // namespace
}  // namespace qel
