#include <gtest/gtest.h>

#include <QtTest/QTest>
#include <algorithm>

#include "ui/Window.h"

namespace qel {
namespace {

using testing::Window;

constexpr auto kLongName = "mo_signalling_ac_barring_for_special_ac";
constexpr auto kLongValue = "KLTE_RRC_CAUSE_REEST_OTHER_FAIL_T310_EXP_AND_A_GOOD_DEAL_MORE";

// Width and height of a phone's window in both orientations, and of a large one.
class Layout : public ::testing::TestWithParam<QSize> {
 protected:
  Layout() {
    window.window().resize(GetParam());
    window.store().myLTERRCStateDict = {
        {"short", 1}, {kLongName, "2017-07-14 02:40:00 UTC"}, {"cause", kLongValue}};
    window.settle();
  }

  QRectF area(const std::string& text) const {
    const QQuickItem* item = window.find(text);
    return item ? item->mapRectToScene(item->boundingRect()) : QRectF();
  }

  Window window;
};

TEST_P(Layout, everyMenuRowIsATargetForAThumb) {
  for (int row = 0; row < 4; ++row) {
    EXPECT_GE(window.row(row)->height(), 48);
    EXPECT_EQ(window.row(row)->width(), GetParam().width());
  }
}

TEST_P(Layout, aShortFieldStandsOnOneLine) {
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  EXPECT_GE(window.row(0)->height(), 48);
  EXPECT_LT(area("short").left(), area("1").left());
  EXPECT_TRUE(area("short").top() < area("1").bottom() && area("1").top() < area("short").bottom());
}

TEST_P(Layout, noTextLeavesTheWindowOrItsRow) {
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  for (const char* text : {"RRC State", "short", "1", kLongName, kLongValue}) {
    const QQuickItem* item = window.find(text);
    if (!item) continue;  // below the fold of a low window
    EXPECT_GE(area(text).left(), 0) << text;
    EXPECT_LE(area(text).right(), GetParam().width()) << text;
    EXPECT_FALSE(item->property("truncated").toBool()) << text;
    EXPECT_LE(item->property("contentWidth").toReal(), item->width() + 0.5) << text;
  }
}

TEST_P(Layout, nameAndValueNeverOverlap) {
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  const QQuickItem* name = window.find(kLongName);
  const QQuickItem* value = window.find("2017-07-14 02:40:00 UTC");
  ASSERT_TRUE(name && value);
  const bool above = area(kLongName).bottom() <= area("2017-07-14 02:40:00 UTC").top();
  const qreal widths =
      name->property("contentWidth").toReal() + value->property("contentWidth").toReal();
  EXPECT_TRUE(above || widths + 16 <= GetParam().width() - 32);
}

TEST_P(Layout, theLineAboutTheModemFitsAboveTheChoices) {
  const char* line = "No modem: the chosen one is not there";
  window.navigation().setCondition(line);
  QMetaObject::invokeMethod(window.list(), "positionViewAtEnd");  // it scrolls with the list
  window.settle();
  ASSERT_TRUE(window.find(line));
  EXPECT_FALSE(window.find(line)->property("truncated").toBool());
  EXPECT_GE(area(line).left(), 0);
  EXPECT_LE(area(line).right(), GetParam().width());
  EXPECT_GE(area(line).top(), area("Test modem").bottom() - 0.5);
  EXPECT_LE(area(line).bottom(), area("System").top() + 0.5);
  EXPECT_LE(area("System").bottom(), GetParam().height());
}

// In a low window it covered the last technology.
TEST_P(Layout, theFootOfTheFirstScreenCoversNoTechnology) {
  QMetaObject::invokeMethod(window.list(), "positionViewAtIndex", Q_ARG(int, 3), Q_ARG(int, 4));
  window.settle();
  ASSERT_TRUE(window.find("GSM"));
  EXPECT_LE(area("GSM").bottom(), GetParam().height());
  EXPECT_TRUE(!window.find("Test modem") || area("Test modem").top() >= area("GSM").bottom());
}

// It was set larger than the room for it, and then broken.
TEST_P(Layout, aTitleThatFitsOnOneLineStandsOnOne) {
  ASSERT_TRUE(window.open("GSM", "Connected Serv Cell Meas"));
  EXPECT_EQ(window.find("Connected Serv Cell Meas")->property("lineCount").toInt(), 1);
}

TEST_P(Layout, whatHasNotComeYetStandsInTheMiddleOfItsRow) {
  ASSERT_TRUE(window.open("Device Info", "IMSI"));
  const QRectF row = window.row(0)->mapRectToScene(window.row(0)->boundingRect());
  EXPECT_NEAR(area("Come back later").center().y(), row.center().y(), 1);
  EXPECT_NEAR(area("Come back later").center().x(), row.center().x(), 1);
}

TEST(Desktop, contentStaysNarrowEnoughToRead) {
  const Window window;
  window.window().resize(1600, 900);
  window.store().myLTERRCStateDict = {{"short", "value"}};
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  const QQuickItem* name = window.find("short");
  const QQuickItem* value = window.find("value");
  ASSERT_TRUE(name && value);
  const qreal left = name->mapToScene(QPointF(0, 0)).x();
  const qreal right = value->mapToScene(QPointF(value->width(), 0)).x();
  EXPECT_LE(right - left, 640);
  EXPECT_NEAR(left, 1600 - right, 1) << "in the middle";
}

INSTANTIATE_TEST_SUITE_P(Sizes, Layout,
                         ::testing::Values(QSize(320, 568), QSize(360, 720), QSize(412, 915),
                                           QSize(720, 1280), QSize(720, 360)),
                         [](const auto& instance) {
                           return std::to_string(instance.param.width()) + "x" +
                                  std::to_string(instance.param.height());
                         });

TEST(LongValues, breakAfterUnderscores) {
  const Window window;
  window.store().myLTERRCStateDict = {{"cause", kLongValue}};
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  const QQuickItem* value = window.find(kLongValue);
  ASSERT_TRUE(value);
  EXPECT_GT(value->property("lineCount").toInt(), 1);
  EXPECT_TRUE(value->property("text").toString().contains(QStringLiteral("KLTE_\u200B")));
}

int rowOf(const TableModel& table, const QString& text) {
  for (int row = 0; row < table.count(); ++row) {
    if (table.data(table.index(row), TableModel::textRole).toString() == text) return row;
  }
  return -1;
}

TEST(Motion, bothScreensAreInSightWhileTheySlide) {
  const Window window(true);
  window.tap("LTE");
  EXPECT_TRUE(
      QTest::qWaitFor([&window] { return window.shows("C-DRX") && !window.shows("UMTS"); }));
  window.navigation().back();
  EXPECT_EQ(window.navigation().depth(), 1);
  EXPECT_EQ(window.navigation().rowCount(), 2) << "the screen that was left is still seen";
  EXPECT_TRUE(window.shows("C-DRX"));
  EXPECT_TRUE(QTest::qWaitFor([&window] { return window.navigation().rowCount() == 1; }))
      << "it goes when it is out of sight";
  EXPECT_TRUE(window.shows("UMTS"));
}

TEST(Motion, aTapDuringTheWayBackOpensTheNextScreen) {
  const Window window(true);
  window.tap("LTE");
  EXPECT_TRUE(QTest::qWaitFor([&window] { return !window.shows("UMTS"); }));
  window.navigation().back();
  window.top().choose(3);
  EXPECT_EQ(window.top().title(), "GSM");
  EXPECT_EQ(window.navigation().rowCount(), 2);
  EXPECT_TRUE(QTest::qWaitFor([&window] { return window.shows("Idle Config"); }));
}

// Two taps on "LTE" opened "RRC State", which slid under the finger.
TEST(Motion, aSecondTapWhileTheScreenSlidesInIsIgnored) {
  const Window window(true);
  ASSERT_TRUE(window.tap("LTE"));
  for (int i = 0; i < 5; ++i) {
    QTest::mouseClick(&window.window(), Qt::LeftButton, Qt::NoModifier, QPoint(100, 90), 20);
  }
  EXPECT_EQ(window.navigation().depth(), 2);
  EXPECT_TRUE(QTest::qWaitFor([&window] {
    QTest::mouseClick(&window.window(), Qt::LeftButton, Qt::NoModifier, QPoint(100, 90), 50);
    return window.navigation().depth() == 3;
  })) << "a tap on a screen that rests counts";
}

TEST(Motion, aDragFromTheLeftEdgeGoesBack) {
  const Window window;
  ASSERT_TRUE(window.tap("LTE"));
  QTest::mousePress(&window.window(), Qt::LeftButton, Qt::NoModifier, QPoint(4, 300));
  for (int x = 10; x <= 320; x += 10) QTest::mouseMove(&window.window(), QPoint(x, 300), 1);
  EXPECT_EQ(window.navigation().depth(), 2) << "the finger is still down";
  QTest::mouseRelease(&window.window(), Qt::LeftButton, Qt::NoModifier, QPoint(320, 300));
  EXPECT_EQ(window.navigation().depth(), 1);
}

TEST(Motion, aDragThatTurnsBackStays) {
  const Window window;
  ASSERT_TRUE(window.tap("LTE"));
  QTest::mousePress(&window.window(), Qt::LeftButton, Qt::NoModifier, QPoint(4, 300));
  for (int x = 10; x <= 200; x += 10) QTest::mouseMove(&window.window(), QPoint(x, 300), 1);
  for (int x = 200; x >= 10; x -= 10) QTest::mouseMove(&window.window(), QPoint(x, 300), 1);
  QTest::mouseRelease(&window.window(), Qt::LeftButton, Qt::NoModifier, QPoint(10, 300));
  EXPECT_EQ(window.navigation().depth(), 2);
}

// Every frame costs as much as that of the values themselves.
TEST(Motion, aChangedValueFadesInFewFrames) {
  const Window window(true);
  window.store().myLTERRCStateDict = {{"state", "before"}};
  window.top().choose(1);
  window.top().choose(rowOf(window.top(), "RRC State"));
  ASSERT_TRUE(QTest::qWaitFor([&window] { return window.row(0) && window.shows("before"); }));
  const auto parts = window.row(0)->childItems();
  const auto isTint = [](const QQuickItem* item) { return item->property("steps").isValid(); };
  const auto tint = std::find_if(parts.begin(), parts.end(), isTint);
  ASSERT_NE(tint, parts.end());
  EXPECT_EQ((*tint)->opacity(), 0);
  window.store().myLTERRCStateDict = {{"state", "after"}};
  window.refresh();
  EXPECT_GT((*tint)->opacity(), 0);
  int frames = 0;
  QObject::connect(&window.window(), &QQuickWindow::frameSwapped, &window.window(),
                   [&frames] { ++frames; });
  EXPECT_TRUE(QTest::qWaitFor([&tint] { return (*tint)->opacity() == 0; }));
  EXPECT_LE(frames, 10);
}

}  // namespace
}  // namespace qel
