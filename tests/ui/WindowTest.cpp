#include <gtest/gtest.h>

#include <algorithm>

#include "ui/Window.h"

namespace qel {
namespace {

using testing::Window;
using Strings = std::vector<std::string>;

TEST(WindowTest, startsWithTheTechnologiesAndSaysWhereValuesComeFrom) {
  const Window window;
  EXPECT_EQ(window.texts(), (Strings{"qelwatch", "Searching: no cell has been reported yet.",
                                     "Device Info", "LTE", "UMTS", "GSM", "Signals", "Happenings",
                                     "Recordings", "Test modem", "System", "Light", "Dark"}));
  EXPECT_EQ(window.warnings(), 0);
}

// The reader of an empty table once could not know that the modem waited for its PIN.
TEST(WindowTest, theFirstScreenSaysHowItIsWithTheModem) {
  const Window window;
  window.window().resize(360, 720);
  window.navigation().setCondition("Modem locked: SIM PIN needed");
  window.settle();
  EXPECT_EQ(window.texts(),
            (Strings{"qelwatch", "Searching: no cell has been reported yet.", "Device Info", "LTE",
                     "UMTS", "GSM", "Signals", "Happenings", "Recordings", "Test modem",
                     "Modem locked: SIM PIN needed", "System", "Light", "Dark"}));
  ASSERT_TRUE(window.tap("LTE"));
  EXPECT_FALSE(window.shows("Modem locked: SIM PIN needed"));
  window.navigation().back();
  window.navigation().setCondition("");
  window.settle();
  EXPECT_FALSE(window.shows("Modem locked: SIM PIN needed"));
  EXPECT_EQ(window.warnings(), 0);
}

TEST(WindowTest, aTapGoesFromTechnologyToCategoryToFields) {
  const Window window;
  window.store().myLTERRCStateDict = {{"state", "KLTE_RRC_STATE_CONNECTED"}, {"cause", 3}};
  ASSERT_TRUE(window.tap("LTE"));
  EXPECT_EQ(window.navigation().depth(), 2);
  EXPECT_TRUE(window.shows("C-DRX"));
  ASSERT_TRUE(window.tap("RRC State"));
  EXPECT_EQ(window.navigation().depth(), 3);
  EXPECT_EQ(window.texts(),
            (Strings{"RRC State", "LTE", "state", "KLTE_RRC_STATE_CONNECTED", "cause", "3"}));
  EXPECT_EQ(window.warnings(), 0);
}

TEST(WindowTest, theWayBackIsAButtonAndAKey) {
  const Window window;
  ASSERT_TRUE(window.open("UMTS", "NAS MM"));
  ASSERT_TRUE(window.tap("UMTS"));
  EXPECT_EQ(window.navigation().depth(), 2);
  window.press(Qt::Key_Escape);
  EXPECT_EQ(window.navigation().depth(), 1);
  window.press(Qt::Key_Escape);
  EXPECT_EQ(window.navigation().depth(), 1) << "the first screen is never left";
}

TEST(WindowTest, aRefreshShowsTheNewValueInPlace) {
  const Window window;
  window.store().myLTERRCStateDict = {{"a", "old"}, {"b", "same"}};
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  const QQuickItem* row = window.row(0);
  window.store().myLTERRCStateDict = {{"a", "new"}, {"b", "same"}};
  window.settle();
  EXPECT_TRUE(window.shows("old")) << "nothing changes between refreshes";
  window.refresh();
  EXPECT_TRUE(window.shows("new"));
  EXPECT_EQ(window.row(0), row) << "the row itself stays";
}

TEST(WindowTest, aRefreshLeavesTheReaderWhereItWas) {
  const Window window;
  EntryList cells;
  for (int i = 0; i < 30; ++i) cells.push_back({{"earfcn", i}, {"rsrp", -90}});
  window.store().myLTE.EutraNbrsMeas = cells;
  ASSERT_TRUE(window.open("LTE", "LTE Neighbor Cell Meas"));
  window.list()->setProperty("contentY", 900);
  window.settle();
  for (auto& cell : cells) cell.set("rsrp", -91);
  cells.push_back({{"earfcn", 99}, {"rsrp", -99}});
  window.store().myLTE.EutraNbrsMeas = cells;
  window.refresh();
  EXPECT_EQ(window.list()->property("contentY").toReal(), 900);
  EXPECT_TRUE(window.shows("-91"));
}

TEST(WindowTest, aListThatShrinksUnderTheReaderIsDrawn) {
  const Window window;
  window.store().myLTE.CAStatusList = EntryList(40, {{"pci", 1}});
  ASSERT_TRUE(window.open("LTE", "CA Status"));
  window.list()->setProperty("contentY", 2000);
  window.settle();
  window.store().myLTE.CAStatusList = {{{"pci", 7}}};
  window.refresh();
  EXPECT_EQ(window.top().count(), 1);
  EXPECT_TRUE(window.shows("7"));
}

TEST(WindowTest, sectionHeadersStickWhileTheirSectionScrolls) {
  const Window window;
  window.store().myLTE.TxPower = EntryList(8, {{"a", 1}, {"b", 2}, {"c", 3}, {"d", 4}, {"e", 5}});
  ASSERT_TRUE(window.open("LTE", "Tx Power"));
  EXPECT_EQ(window.texts()[2], "TxPowerInfo 0");
  window.list()->setProperty("contentY", 700);
  window.settle();
  const int top = static_cast<int>(window.list()->mapToScene(QPointF(0, 0)).y());
  const std::string section = window.list()->property("currentSection").toString().toStdString();
  EXPECT_NE(section, "TxPowerInfo 0");
  const QQuickItem* header = window.find(section);
  ASSERT_TRUE(header);
  EXPECT_NEAR(header->mapToScene(QPointF(0, 0)).y(), top, 24);
}

TEST(WindowTest, thePlaceholderIsWrittenOnce) {
  const Window window;
  ASSERT_TRUE(window.open("LTE", "EUTRA Neighbor Info"));
  const Strings texts = window.texts();
  EXPECT_EQ(std::count(texts.begin(), texts.end(), "Waiting for Update"), 1);
}

TEST(WindowTest, aTableWithoutTextSaysWhatWillAppear) {
  const Window window;
  ASSERT_TRUE(window.open("LTE", "NAS"));
  EXPECT_TRUE(
      window.shows("The fields of LTE NAS appear here with the first report of the modem."));
  window.store().myLTEEMMContextDict = {{"reg_status", 1}};
  window.refresh();
  EXPECT_TRUE(window.shows("reg_status"));
}

TEST(WindowTest, anEmptyListSaysWhatWillAppear) {
  const Window window;
  window.store().myLTE.CAStatusList.clear();
  ASSERT_TRUE(window.open("LTE", "CA Status"));
  EXPECT_EQ(window.texts().size(), 3U) << "title, technology and one sentence";
}

// It once read "Entries of LTE LTE Neighbor Cell Meas".
TEST(WindowTest, aTitleThatNamesItsTechnologyDoesSoOnceInASentence) {
  const Window window;
  window.store().myLTE.EutraNbrsMeas.clear();
  ASSERT_TRUE(window.open("LTE", "LTE Neighbor Cell Meas"));
  EXPECT_TRUE(
      window.shows("The last report of LTE Neighbor Cell Meas lists nothing. The next one that "
                   "lists something appears here."));
}

// Three screens read "Serving Cell Info".
TEST(WindowTest, theTechnologyStandsUnderEveryCategorysTitle) {
  const Window window;
  for (const char* technology : {"LTE", "UMTS", "GSM"}) {
    ASSERT_TRUE(window.open(technology, "Serving Cell Info"));
    EXPECT_EQ(window.texts()[0], "Serving Cell Info");
    EXPECT_EQ(window.texts()[1], technology);
  }
}

TEST(WindowTest, aBlankValueIsADash) {
  const Window window;
  window.store().myLTERRCStateDict = {{"cause", ""}, {"state", "idle"}};
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  EXPECT_EQ(window.texts(), (Strings{"RRC State", "LTE", "cause", "\u2013", "state", "idle"}));
}

TEST(WindowTest, arrowsMoveTheFocusAndEnterOpens) {
  const Window window;
  window.press(Qt::Key_Down);
  EXPECT_TRUE(window.appearance().isKeyboardInUse());
  window.press(Qt::Key_Down);
  EXPECT_EQ(window.list()->property("currentIndex").toInt(), 2);
  window.press(Qt::Key_Return);
  EXPECT_EQ(window.top().title(), "UMTS");
  window.press(Qt::Key_End);
  EXPECT_EQ(window.list()->property("currentIndex").toInt(), 14);
  window.press(Qt::Key_Down);
  EXPECT_EQ(window.list()->property("currentIndex").toInt(), 14) << "there is nothing below";
  window.press(Qt::Key_Home);
  window.press(Qt::Key_Up);
  EXPECT_EQ(window.list()->property("currentIndex").toInt(), 0);
  window.press(Qt::Key_Escape);
  EXPECT_EQ(window.list()->property("currentIndex").toInt(), 2) << "as it was left";
}

TEST(WindowTest, tabReachesEverythingAndEnterWorksThere) {
  const Window window;
  for (int i = 0; i < 7; ++i) window.press(Qt::Key_Tab);
  window.press(Qt::Key_Return);
  EXPECT_TRUE(window.appearance().isDark()) << "now, three pages, system, light, dark";
  window.press(Qt::Key_Tab);
  window.press(Qt::Key_Return);
  EXPECT_EQ(window.navigation().depth(), 2) << "from the last choice round to the list";
  window.press(Qt::Key_Tab);
  window.press(Qt::Key_Return);
  EXPECT_EQ(window.navigation().depth(), 1) << "the way back";
}

TEST(WindowTest, aFieldLeadsNowhere) {
  const Window window;
  window.store().myLTERRCStateDict = {{"a", 1}};
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  window.tap(*window.row(0));
  window.press(Qt::Key_Return);
  EXPECT_EQ(window.navigation().depth(), 3);
}

TEST(WindowTest, theChoiceOfThemeIsKept) {
  {
    const Window window;
    EXPECT_FALSE(window.appearance().isDark());
    ASSERT_TRUE(window.tap("Dark"));
    EXPECT_TRUE(window.appearance().isDark());
  }
  const Appearance next;
  EXPECT_EQ(next.theme(), Appearance::Dark);
}

TEST(WindowTest, aThemeForThisRunOnlyIsNotKept) {
  Appearance now;
  now.overrideTheme(Appearance::Dark);
  EXPECT_TRUE(now.isDark());
  const Appearance next;
  EXPECT_EQ(next.theme(), Appearance::System);
}

TEST(WindowTest, aNoticeStandsUnderTheTitleOfEveryScreen) {
  const Window window;
  window.navigation().setNotice(QStringLiteral("The service is gone."));
  window.settle();
  EXPECT_EQ(window.texts()[1], "The service is gone.");
  ASSERT_TRUE(window.tap("LTE"));
  EXPECT_TRUE(window.shows("The service is gone."));
  window.navigation().setNotice({});
  window.settle();
  EXPECT_FALSE(window.shows("The service is gone."));
}

}  // namespace
}  // namespace qel
