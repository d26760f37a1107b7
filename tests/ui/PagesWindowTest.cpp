// The pages beside the tables, as a finger and a keyboard meet them.

#include <gtest/gtest.h>

#include <QtCore/QElapsedTimer>
#include <QtCore/QPointer>
#include <QtGui/QClipboard>
#include <QtGui/QGuiApplication>
#include <QtTest/QTest>

#include "messages/lte_rrc.h"
#include "ui/Reports.h"
#include "ui/Window.h"

namespace qel {
namespace {

using testing::comesToShow;
using testing::report;
using testing::reportCell;
using testing::reportLevel;
using testing::Window;

TEST(PagesInTheWindow, theFirstScreenShowsTheCellAndItsLevel) {
  const Window window;
  reportCell(123);
  reportLevel(-86);
  EXPECT_TRUE(comesToShow(window, "-86"));
  EXPECT_TRUE(window.shows("good"));
  EXPECT_TRUE(window.shows("PCI 123, EARFCN 1300"));
  EXPECT_TRUE(window.shows("LTE 3"));
  EXPECT_EQ(window.warnings(), 0);
}

TEST(PagesInTheWindow, aLineThatSaysTheSameIsNotMadeAnew) {
  const Window window;
  reportCell(123);
  reportLevel(-86);
  ASSERT_TRUE(comesToShow(window, "-86"));
  const QPointer<QQuickItem> line = window.find("PCI 123, EARFCN 1300");
  ASSERT_TRUE(line);
  reportLevel(-90);
  ASSERT_TRUE(comesToShow(window, "-90"));
  EXPECT_TRUE(line);
}

TEST(PagesInTheWindow, aTapOnTheLevelOpensItsCurves) {
  const Window window;
  reportCell(123);
  reportLevel(-86);
  ASSERT_TRUE(comesToShow(window, "-86"));
  ASSERT_TRUE(window.tap("-86"));
  EXPECT_EQ(window.navigation().topKind(), "signals");
  EXPECT_TRUE(window.shows("LTE RSRP"));
  EXPECT_EQ(window.warnings(), 0);
}

TEST(PagesInTheWindow, everyPageHasAKeyAndAWord) {
  const Window window;
  const std::vector<std::tuple<Qt::Key, const char*, const char*>> pages = {
      {Qt::Key_S, "Signals", "signals"},
      {Qt::Key_H, "Happenings", "happenings"},
      {Qt::Key_R, "Recordings", "recordings"}};
  for (const auto& [key, word, kind] : pages) {
    window.press(key);
    EXPECT_EQ(window.navigation().topKind(), kind);
    EXPECT_TRUE(window.shows(word));
    window.press(Qt::Key_Escape);
    EXPECT_EQ(window.navigation().depth(), 1);
    ASSERT_TRUE(window.tap(word));
    EXPECT_EQ(window.navigation().topKind(), kind);
    window.press(Qt::Key_Escape);
  }
  EXPECT_EQ(window.warnings(), 0);
}

TEST(PagesInTheWindow, aPageThatIsOnTheStackIsGoneBackTo) {
  const Window window;
  window.press(Qt::Key_S);
  window.press(Qt::Key_H);
  EXPECT_EQ(window.navigation().depth(), 3);
  window.press(Qt::Key_S);
  EXPECT_EQ(window.navigation().depth(), 2);
  EXPECT_EQ(window.navigation().topKind(), "signals");
  window.navigation().open("nonsense");
  EXPECT_EQ(window.navigation().depth(), 2);
}

TEST(PagesInTheWindow, happeningsAreFilteredByKind) {
  const Window window;
  reportCell(123);
  KCellularLteRrcState state;
  state.setState(3);
  report(MetricValidator::K_LTE_RRC_STATE, state);
  window.press(Qt::Key_H);
  RowsModel* rows = window.navigation().pages()->happenings()->rows();
  const int all = rows->count();
  ASSERT_GE(all, 2);
  EXPECT_TRUE(window.shows("Today"));
  window.navigation().pages()->happenings()->toggle("cell");
  EXPECT_EQ(rows->count(), 1);
  window.navigation().pages()->happenings()->toggle("cell");
  EXPECT_EQ(rows->count(), all);
  EXPECT_EQ(window.warnings(), 0);
}

// An instrument on a battery: whoever looks at curves while nothing comes pays nothing.
TEST(PagesInTheWindow, whileNothingComesNothingIsDrawn) {
  const Window window;
  reportCell(123);
  reportLevel(-86);
  window.press(Qt::Key_S);
  ASSERT_TRUE(comesToShow(window, "LTE RSRP"));
  QTest::qWait(700);
  int frames = 0;
  QObject::connect(&window.window(), &QQuickWindow::frameSwapped, [&frames] { ++frames; });
  QTest::qWait(1500);
  EXPECT_EQ(frames, 0);
  reportLevel(-90);
  window.navigation().pages()->look();
  EXPECT_TRUE(QTest::qWaitFor([&frames] { return frames > 0; })) << "what comes is drawn";
}

TEST(PagesInTheWindow, curvesAreReadOffWithKeys) {
  const Window window;
  reportCell(123);
  reportLevel(-86);
  window.press(Qt::Key_S);
  ASSERT_TRUE(comesToShow(window, "LTE RSRP"));
  SignalsModel* curves = window.navigation().pages()->curves();
  curves->readPrevious(0);
  ASSERT_FALSE(curves->readOff().toMap().isEmpty());
  EXPECT_EQ(curves->readOff().toMap()["values"].toList().first().toMap()["text"], "-86 dBm");
  EXPECT_TRUE(curves->canZoomIn());
  const auto before = curves->range().spanMs;
  window.press(Qt::Key_Plus);
  EXPECT_LT(curves->range().spanMs, before);
  curves->stopReading();
  EXPECT_TRUE(curves->readOff().toMap().isEmpty());
}

TEST(PagesInTheWindow, aTapOnAFieldOpensItsSheetAndEscapeClosesIt) {
  const Window window;
  reportCell(123);
  ASSERT_TRUE(window.open("LTE", "Serving Cell Info"));
  window.tap(*window.row(0));
  const SheetModel* sheet = window.navigation().pages()->sheet();
  ASSERT_TRUE(sheet->isOpen());
  window.settle();
  EXPECT_TRUE(window.shows(sheet->label().toStdString()));
  sheet->copy();
  EXPECT_TRUE(QGuiApplication::clipboard()->text().contains(sheet->label()));
  window.press(Qt::Key_Escape);
  EXPECT_FALSE(sheet->isOpen());
  EXPECT_EQ(window.navigation().depth(), 3) << "the table stays";
  window.press(Qt::Key_Escape);
  EXPECT_EQ(window.navigation().depth(), 2);
  EXPECT_EQ(window.warnings(), 0);
}

TEST(PagesInTheWindow, aSheetAndItsRowShowTheSameValue) {
  const Window window;
  reportCell(123);
  ASSERT_TRUE(window.open("LTE", "Serving Cell Info"));
  const TableModel& table = window.top();
  const auto rows = table.match(table.index(0), TableModel::textRole, "phy_cell_id");
  ASSERT_EQ(rows.size(), 1);
  const QModelIndex row = rows.first();
  reportCell(124);
  window.tap(*window.row(row.row()));
  const SheetModel* sheet = window.navigation().pages()->sheet();
  EXPECT_EQ(sheet->value(), "124");
  EXPECT_EQ(row.data(TableModel::detailRole), "124");
  reportCell(125);
  window.navigation().pages()->look();
  QTest::qWait(700);  // in which a page would have followed
  EXPECT_EQ(sheet->value(), "124");
  EXPECT_EQ(row.data(TableModel::detailRole), "124");
  window.refresh();
  EXPECT_EQ(sheet->value(), "125");
  EXPECT_EQ(row.data(TableModel::detailRole), "125");
}

TEST(PagesInTheWindow, aRowThatIsNoFieldOpensNoSheet) {
  const Window window;
  ASSERT_TRUE(window.open("LTE", "EUTRA Neighbor Info"));
  window.tap(*window.row(0));
  EXPECT_FALSE(window.navigation().pages()->sheet()->isOpen());
}

TEST(PagesInTheWindow, theBarSaysThatNothingComes) {
  const Window window;
  Feed feed;
  window.navigation().pages()->setFeed(feed);
  window.settle();
  EXPECT_TRUE(window.shows("Connected, no reports yet"));
  feed.reach = Feed::Reach::notInstalled;
  window.navigation().pages()->setFeed(feed);
  window.settle();
  EXPECT_TRUE(window.shows("Baseband manager: not installed"));
}

}  // namespace
}  // namespace qel
