// The window with a screen reader: what is there is said, what can be done can be set off, and
// where the keyboard goes is told.

#include <gtest/gtest.h>

#include <QtTest/QTest>
#include <algorithm>
#include <set>

#include "messages/lte_rrc.h"
#include "recording/Mark.h"
#include "support/RecordedLines.h"
#include "ui/Reports.h"
#include "ui/Spoken.h"
#include "ui/Window.h"

namespace qel {
namespace {

using namespace testing;
using Role = QAccessible::Role;
using Names = std::vector<std::string>;

class WithAScreenReader : public ::testing::Test {
 protected:
  void TearDown() override { EXPECT_EQ(window.warnings(), 0); }

  SpokenItem item(Role role, const std::string& name) const { return spoken(window, role, name); }
  bool has(Role role, const std::string& name) const { return item(role, name).role == role; }
  std::string said() const {
    std::string all;
    for (const SpokenItem& each : spokenItems(window)) {
      all += std::to_string(each.role) + " \"" + each.name + "\"\n";
    }
    return all;
  }
  void record() const {
    window.navigation().pages()->recorder()->setControl(std::make_unique<RecordingControl>(
        RecordingsFolder(folder.path()),
        RecordingControl::Way{std::make_shared<FakeConnector>(std::make_shared<FakeService>()),
                              std::nullopt, Bytes{1}}));
  }
  bool openRecording() const {
    const std::string file = folder.file("drive.jsonl", lineOf(lteCell(1'500'000'000'000, 1)) +
                                                            lineOf(lteCell(1'500'000'100'000, 2)));
    PlaybackModel& playback = *window.navigation().pages()->playback();
    playback.open(file);
    const bool opened = QTest::qWaitFor([&playback] { return playback.isOpen(); });
    window.settle();
    return opened;
  }

  const ScreenReaderEars ears;
  const TemporaryFolder folder;
  Window window;
};

// Punctuation and case are not heard.
std::set<std::string> wordsOf(const std::string& text) {
  std::set<std::string> words;
  std::string word;
  for (const char c : text + " ") {
    if (std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '-' || c == '_') {
      word += static_cast<char>(std::tolower(c));
    } else if (!word.empty()) {
      words.insert(std::exchange(word, {}));
    }
  }
  words.erase("-");
  return words;
}

// What is said at a place: of the item, of those beside it, and of all that it is part of.
std::string saidAbout(const QQuickItem* item,
                      const std::map<const QQuickItem*, std::string>& said) {
  std::string all;
  const auto add = [&](const QQuickItem* about) {
    const auto found = said.find(about);
    if (found != said.end()) all += found->second + " ";
  };
  for (const QQuickItem* around = item; around; around = around->parentItem()) add(around);
  if (!item->parentItem()) return all;
  for (const QQuickItem* beside : item->parentItem()->childItems()) add(beside);
  return all;
}

void expectAllIsSaid(const Window& window) {
  std::map<const QQuickItem*, std::string> said;
  for (const SpokenItem& each : spokenItems(window)) {
    if (each.item) said[each.item] = each.name + " " + each.description;
  }
  for (const QQuickItem* item : window.itemsInSight()) {
    if (!item->inherits("QQuickText")) continue;
    QString text = item->property("text").toString();
    text.remove(QChar(0x200B));
    const auto heard = wordsOf(saidAbout(item, said));
    for (const std::string& word : wordsOf(text.toStdString())) {
      EXPECT_TRUE(heard.contains(word)) << word << " of \"" << text.toStdString() << '"';
    }
  }
}

void expectAllCanBeSetOff(const Window& window) {
  std::map<const QQuickItem*, SpokenItem> said;
  for (const SpokenItem& each : spokenItems(window)) said[each.item] = each;
  for (const QQuickItem* item : window.itemsInSight()) {
    const bool isTarget = item->metaObject()->indexOfSignal("tapped()") >= 0;
    const bool takesKeys = item->activeFocusOnTab() && !item->inherits("QQuickText");
    if (!isTarget && !takesKeys) continue;
    const std::string what = item->metaObject()->className();
    const auto found = said.find(item);
    if (found == said.end()) {
      EXPECT_FALSE(isTarget) << what << " " << item->property("text").toString().toStdString();
      continue;  // the keys of a list, whose rows are told of
    }
    EXPECT_NE(found->second.role, QAccessible::NoRole) << what;
    EXPECT_NE(found->second.name, "") << what;
    EXPECT_TRUE(found->second.state.focusable) << what << " " << found->second.name;
    EXPECT_FALSE(found->second.actions.isEmpty()) << what << " " << found->second.name;
  }
}

void expectAllIsRead(const Window& window, const std::string& where) {
  SCOPED_TRACE(where);
  expectAllIsSaid(window);
  expectAllCanBeSetOff(window);
}

TEST_F(WithAScreenReader, everythingOnEveryScreenIsReadAndCanBeSetOff) {
  record();
  reportCell(123);
  reportLevel(-86);
  ASSERT_TRUE(comesToShow(window, "-86"));
  expectAllIsRead(window, "first screen");
  for (const char* page : {"signals", "happenings", "recordings"}) {
    window.navigation().open(page);
    window.settle();
    expectAllIsRead(window, page);
    window.navigation().back();
  }
  for (const auto& [technology, category] :
       {std::pair("LTE", "Serving Cell Info"), std::pair("LTE", "RRC State"),
        std::pair("LTE", "EUTRA Neighbor Info"), std::pair("LTE", "NAS"),
        std::pair("Device Info", "IMSI")}) {
    ASSERT_TRUE(window.open(technology, category));
    expectAllIsRead(window, category);
  }
  ASSERT_TRUE(window.open("LTE", "Serving Cell Info"));
  window.tap(*window.row(0));
  expectAllIsRead(window, "sheet");
  window.press(Qt::Key_Escape);
  ASSERT_TRUE(openRecording());
  expectAllIsRead(window, "opened recording");
  window.navigation().setNotice("The service is gone.");
  window.settle();
  expectAllIsRead(window, "with a notice");
}

TEST_F(WithAScreenReader, theFirstScreenIsHeadingsButtonsAndRows) {
  EXPECT_TRUE(has(QAccessible::Heading, "qelwatch"));
  EXPECT_TRUE(has(QAccessible::Button, "Searching: no cell has been reported yet."));
  EXPECT_TRUE(has(QAccessible::List, "qelwatch"));
  for (const char* row : {"Device Info", "LTE", "UMTS", "GSM"}) {
    EXPECT_TRUE(has(QAccessible::ListItem, row)) << row << '\n' << said();
  }
  for (const char* page : {"Signals", "Happenings", "Recordings"}) {
    EXPECT_TRUE(has(QAccessible::Button, page)) << page;
  }
  EXPECT_TRUE(has(QAccessible::StaticText, "Test modem")) << said();
  EXPECT_TRUE(item(QAccessible::RadioButton, "System").state.checked);
  EXPECT_FALSE(item(QAccessible::RadioButton, "Dark").state.checked);
}

// What is made first was told first: the foot before the rows, and the title last.
TEST_F(WithAScreenReader, theFirstScreenIsReadFromTopToBottom) {
  reportCell(123);
  ASSERT_TRUE(comesToShow(window, "PCI 123, EARFCN 1300"));
  const auto all = spokenItems(window);
  const auto placeOf = [&all](const std::string& name) {
    return std::ranges::find_if(all,
                                [&name](const SpokenItem& item) {
                                  return item.name.find(name) != std::string::npos &&
                                         item.role != QAccessible::Window &&
                                         item.role != QAccessible::Pane &&
                                         item.role != QAccessible::List;
                                }) -
           all.begin();
  };
  const std::vector<std::string> inOrder = {"qelwatch", "PCI 123", "Device Info", "UMTS",
                                            "GSM",      "Signals", "System"};
  for (std::size_t i = 1; i < inOrder.size(); ++i) {
    EXPECT_LT(placeOf(inOrder[i - 1]), placeOf(inOrder[i])) << inOrder[i] << '\n' << said();
  }
}

TEST_F(WithAScreenReader, theCellIsReadAsOneSentenceWithEveryValue) {
  reportCell(123);
  reportLevel(-86);
  ASSERT_TRUE(comesToShow(window, "-86"));
  for (const char* part : {"LTE band 3", "PCI 123", "RSRP -86 dBm, good", "RSRQ -9 dB", "SINR"}) {
    EXPECT_TRUE(isSpoken(window, QAccessible::Button, part)) << part << '\n' << said();
  }
}

TEST_F(WithAScreenReader, everyFieldIsReadWithItsValue) {
  window.store().myLTERRCStateDict = {{"state", "KLTE_RRC_STATE_CONNECTED"}, {"cause", ""}};
  ASSERT_TRUE(window.open("LTE", "RRC State"));
  EXPECT_TRUE(has(QAccessible::Heading, "RRC State, LTE"));
  EXPECT_TRUE(has(QAccessible::ListItem, "state: KLTE_RRC_STATE_CONNECTED"));
  EXPECT_TRUE(has(QAccessible::ListItem, "cause: empty"));
  EXPECT_TRUE(has(QAccessible::Button, "Back to LTE"));
  window.store().myLTERRCStateDict = {{"state", "KLTE_RRC_STATE_IDLE"}, {"cause", ""}};
  window.refresh();
  EXPECT_TRUE(has(QAccessible::ListItem, "state: KLTE_RRC_STATE_IDLE"));
}

TEST_F(WithAScreenReader, sectionsAreHeadings) {
  window.store().myLTE.EutraNbrs = {{{"pci", 5}}, {{"pci", 6}}};
  ASSERT_TRUE(window.open("LTE", "EUTRA Neighbor Info"));
  EXPECT_TRUE(has(QAccessible::Heading, "EUTRA Neighbor 1")) << said();
}

TEST_F(WithAScreenReader, aRowAndAButtonAreSetOffAsByAFinger) {
  ASSERT_TRUE(press(item(QAccessible::ListItem, "UMTS")));
  window.settle();
  EXPECT_EQ(window.top().title(), "UMTS");
  ASSERT_TRUE(press(item(QAccessible::Button, "Back to qelwatch")));
  window.settle();
  EXPECT_EQ(window.navigation().depth(), 1);
  ASSERT_TRUE(press(item(QAccessible::Button, "Happenings")));
  EXPECT_EQ(window.navigation().topKind(), "happenings");
}

TEST_F(WithAScreenReader, aChartSaysItsCourseAndReadsOff) {
  reportCell(123);
  reportLevel(-86);
  window.press(Qt::Key_S);
  ASSERT_TRUE(comesToShow(window, "LTE RSRP"));
  const SpokenItem chart = item(QAccessible::Chart, "LTE RSRP, RSRP -86 dBm, good, always -86 dBm");
  ASSERT_EQ(chart.role, QAccessible::Chart) << said();
  const QString back = QAccessibleActionInterface::decreaseAction();
  ASSERT_TRUE(chart.actions.contains(back));
  chart.interface->actionInterface()->doAction(back);
  EXPECT_TRUE(isSpoken(window, QAccessible::Chart, "Serving -86 dBm")) << said();
}

TEST_F(WithAScreenReader, aSheetIsADialogThatSaysItsValueFirst) {
  reportCell(123);
  ASSERT_TRUE(window.open("LTE", "Serving Cell Info"));
  const TableModel& table = window.top();
  const auto rows = table.match(table.index(0), TableModel::textRole, "phy_cell_id");
  ASSERT_EQ(rows.size(), 1);
  ScreenReaderEars::heard();
  window.top().choose(rows.first().row());
  window.settle();
  const std::string label = window.navigation().pages()->sheet()->label().toStdString();
  EXPECT_EQ(ScreenReaderEars::heard(), (Names{label + ": 123"}));
  EXPECT_TRUE(has(QAccessible::Dialog, label + ": 123")) << said();
  EXPECT_TRUE(has(QAccessible::Heading, label));
  EXPECT_TRUE(has(QAccessible::StaticText, "123"));
  EXPECT_TRUE(isSpoken(window, QAccessible::ListItem, "Raw value: 123"));
  ASSERT_TRUE(press(item(QAccessible::Button, "Close")));
  EXPECT_FALSE(window.navigation().pages()->sheet()->isOpen());
}

TEST_F(WithAScreenReader, happeningsAndTheirFilterAreRead) {
  reportCell(123);
  KCellularLteRrcState state;
  state.setState(3);
  report(MetricValidator::K_LTE_RRC_STATE, state);
  window.press(Qt::Key_H);
  EXPECT_TRUE(isSpoken(window, QAccessible::ListItem, "Cell: ")) << said();
  EXPECT_TRUE(has(QAccessible::Heading, "Today"));
  const SpokenItem kind = item(QAccessible::CheckBox, "Cell, 1");
  ASSERT_EQ(kind.role, QAccessible::CheckBox) << said();
  EXPECT_FALSE(kind.state.checked);
  ASSERT_TRUE(press(kind));
  EXPECT_TRUE(item(QAccessible::CheckBox, "Cell, 1").state.checked);
}

TEST_F(WithAScreenReader, recordingIsButtonsThatSayWhatTheyDo) {
  record();
  window.settle();
  ASSERT_TRUE(press(item(QAccessible::Button, "Record")));
  window.settle();
  EXPECT_FALSE(has(QAccessible::Button, "Record"));
  ASSERT_TRUE(press(item(QAccessible::Button, "Mark this moment")));
  ASSERT_TRUE(press(item(QAccessible::Button, "Stop recording")));
  window.settle();
  EXPECT_TRUE(has(QAccessible::Button, "Record"));
}

TEST_F(WithAScreenReader, theMomentOfARecordingIsASliderWithAValue) {
  ASSERT_TRUE(openRecording());
  const PlaybackModel& playback = *window.navigation().pages()->playback();
  const SpokenItem slider = item(
      QAccessible::Slider, "Moment of the recording, " + playback.positionText().toStdString());
  ASSERT_EQ(slider.role, QAccessible::Slider) << said();
  QAccessibleValueInterface* value = slider.interface->valueInterface();
  ASSERT_TRUE(value);
  EXPECT_EQ(value->minimumValue().toReal(), 0);
  EXPECT_EQ(value->maximumValue().toReal(), 1);
  value->setCurrentValue(0.5);
  EXPECT_NEAR(playback.position(), 0.5, 0.01);
  window.navigation().pages()->playback()->jumpTo(1);
  EXPECT_EQ(value->currentValue().toReal(), 1);
  for (const char* button : {"Happening before", "Next happening", "Play", "Speed 1x", "Close"}) {
    EXPECT_TRUE(has(QAccessible::Button, button)) << button << '\n' << said();
  }
  const SpokenItem next = item(QAccessible::Button, "Next happening");
  EXPECT_EQ(next.description, "Not now") << "it is at the end";
  press(next);
  EXPECT_EQ(playback.position(), 1);
}

TEST_F(WithAScreenReader, whatTheReaderShouldKnowIsANotice) {
  window.navigation().setNotice("The service is gone.");
  window.settle();
  EXPECT_TRUE(has(QAccessible::AlertMessage, "The service is gone."));
}

TEST_F(WithAScreenReader, whereTheKeyboardGoesIsTold) {
  ScreenReaderEars::heard();
  window.press(Qt::Key_Down);
  window.press(Qt::Key_Down);
  EXPECT_EQ(ScreenReaderEars::heard(), (Names{"LTE", "UMTS"}));
  EXPECT_TRUE(item(QAccessible::ListItem, "UMTS").state.focused);
  EXPECT_FALSE(item(QAccessible::ListItem, "LTE").state.focused);
  window.press(Qt::Key_Return);
  const Names opened = ScreenReaderEars::heard();
  ASSERT_FALSE(opened.empty());
  EXPECT_EQ(
      opened.back(),
      window.top().data(window.top().index(0), TableModel::textRole).toString().toStdString());
  window.press(Qt::Key_Escape);
  const Names back = ScreenReaderEars::heard();
  ASSERT_FALSE(back.empty());
  EXPECT_EQ(back.back(), "UMTS") << "where it was left";
  window.press(Qt::Key_Tab);
  EXPECT_EQ(ScreenReaderEars::heard(), (Names{"Searching: no cell has been reported yet."}));
}

}  // namespace
}  // namespace qel
