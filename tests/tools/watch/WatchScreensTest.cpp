// qelctl watch as a person sees it: real keys, real screens.

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <regex>

#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "metrics/MetricValidator.h"
#include "support/RecordedLines.h"
#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"
#include "tools/watch/Tmux.h"

namespace qel::testing {
namespace {

using V = MetricValidator;

std::string at(std::uint64_t timeMs, std::string line) {
  return line.replace(line.find("\"time_ms\": 1,"), 13,
                      "\"time_ms\": " + std::to_string(timeMs) + ",");
}

std::string cellLine(std::uint32_t pci) {
  KCellularLteScellInfo cell;
  cell.setPhyCellId(pci);
  cell.setDlFreq(1300);
  cell.setCellId((4660U << 8U) + pci);
  cell.setTrackingAreaCode(4711);
  cell.setNumMncDigits(2);
  cell.setSelPlmnMcc(1);
  cell.setSelPlmnMnc(1);
  return metricLine(V::K_LTE_SCELL_INFO, cell);
}

std::string signalLine(std::int32_t rsrp) {
  auto average = std::make_shared<RsrpRsrqSinr>();
  average->setRsrp0(rsrp);
  KCellularLteRsrpRsrqSinr report;
  report.setAvgValues(average);
  return metricLine(V::K_LTE_RSRP_RSRQ_SINR, report);
}

std::string stateLine() {
  KCellularLteRrcState state;
  state.setState(1);
  return metricLine(V::K_LTE_RRC_STATE, state);
}

constexpr std::uint64_t kStart = 1'800'000'000'000;  // 08:00 UTC

// Two cells and three levels within a minute.
std::string drive() {
  return at(kStart, cellLine(1)) + at(kStart, stateLine()) + at(kStart, signalLine(-90)) +
         at(kStart + 1000, signalLine(-90)) + at(kStart + 30'000, cellLine(2)) +
         at(kStart + 60'000, signalLine(-120));
}

class WatchScreens : public ::testing::Test {
 protected:
  const TemporaryRecording recording{drive(), "drive.jsonl"};
  const std::string program = "env TZ=UTC0 LC_ALL=C.UTF-8 " QEL_QELCTL " watch ";

  static ::testing::AssertionResult becomes(const Tmux& terminal, const std::string& text) {
    if (eventually([&] { return terminal.shows(text); })) return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << "no \"" << text << "\" on\n" << terminal.screen();
  }
};

TEST_F(WatchScreens, showTheCellAboveTheMenu) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "LTE band 3, 1815.0 MHz"));
  for (const char* text : {"Operator 001-01", "EARFCN 1300", "TAC 4711", "RSRP", "good", "LTE",
                           "UMTS", "GSM", "Signals", "Happenings", "Recordings"}) {
    EXPECT_TRUE(terminal.shows(text)) << text << " is not on\n" << terminal.screen();
  }
}

TEST_F(WatchScreens, moveToTheMomentOfTheNextHappening) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.press("n");
  ASSERT_TRUE(becomes(terminal, "PCI 2,"));
  terminal.press("p");
  EXPECT_TRUE(becomes(terminal, "PCI 1,"));
}

TEST_F(WatchScreens, playOnWithoutAnyKey) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  for (int i = 0; i < 5; ++i) terminal.press("f");  // 60 times as fast
  terminal.press("Space");
  EXPECT_TRUE(becomes(terminal, "PCI 2,"));
  EXPECT_TRUE(becomes(terminal, "0:01:00 of 0:01:00"));
  EXPECT_TRUE(becomes(terminal, "stands"));
}

TEST_F(WatchScreens, openPagesByLetterAndLeaveThemWithEscape) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.press("s");
  EXPECT_TRUE(becomes(terminal, "LTE RSRP"));
  EXPECT_TRUE(becomes(terminal, "-95  good"));
  terminal.press("h");
  EXPECT_TRUE(becomes(terminal, "Friday, 15 January 2027"));
  terminal.press("r");
  EXPECT_TRUE(becomes(terminal, "d delete"));
  terminal.press("Escape");
  EXPECT_TRUE(becomes(terminal, "Operator 001-01"));
}

TEST_F(WatchScreens, filterHappeningsByKind) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.press("n");
  ASSERT_TRUE(becomes(terminal, "PCI 2,"));
  terminal.press("h");
  ASSERT_TRUE(becomes(terminal, "All kinds"));
  EXPECT_TRUE(terminal.shows("Connection"));
  terminal.press("Right");
  ASSERT_TRUE(becomes(terminal, "Cell only"));
  EXPECT_FALSE(terminal.shows("Connection"));
  EXPECT_TRUE(terminal.shows("PCI 2"));
  terminal.press("a");
  EXPECT_TRUE(becomes(terminal, "All kinds"));
}

TEST_F(WatchScreens, leadToACategoryTableAsTheWindowDoes) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.press("Down");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "Serving Cell Info"));
  terminal.press("Down");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "KLTE_RRC_STATE_IDLE"));
  EXPECT_TRUE(terminal.shows("RRC State"));
  terminal.press("Escape");
  EXPECT_TRUE(becomes(terminal, "Serving Cell Info"));
  terminal.press("Escape");
  EXPECT_TRUE(becomes(terminal, "Operator 001-01"));
}

TEST_F(WatchScreens, tellOfATerminalThatIsTooSmallAndGoOnInALargerOne) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.resize(60, 20);
  EXPECT_TRUE(becomes(terminal, "The terminal has 60x20 characters; 80x24 are needed."));
  terminal.resize(100, 30);
  EXPECT_TRUE(becomes(terminal, "Operator 001-01"));
}

TEST_F(WatchScreens, giveBackTheScreenThatWasThere) {
  const Tmux terminal(80, 24,
                      "echo before; " + program + recording.path() + "; echo ended $?; cat");
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  EXPECT_FALSE(terminal.shows("before"));
  terminal.press("q");
  ASSERT_TRUE(becomes(terminal, "ended 0"));
  EXPECT_TRUE(terminal.shows("before"));
  EXPECT_FALSE(terminal.shows("Operator"));
}

TEST_F(WatchScreens, goOnAfterTheShellStoppedThem) {
  const Tmux terminal(80, 24, "env PS1='shell> ' bash --norc --noprofile -i");
  ASSERT_TRUE(becomes(terminal, "shell>"));
  terminal.press(program + recording.path());
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.press("C-z");
  ASSERT_TRUE(becomes(terminal, "Stopped"));
  EXPECT_FALSE(terminal.shows("Operator 001-01"));
  terminal.press("fg");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "Operator 001-01"));
  terminal.press("n");
  EXPECT_TRUE(becomes(terminal, "PCI 2,"));
  terminal.press("q");
  EXPECT_TRUE(becomes(terminal, "shell>"));
}

TEST_F(WatchScreens, showASimulatedModemWithoutAnyService) {
  const Tmux terminal(80, 24, program + "--source simulated,speed=20");
  EXPECT_TRUE(becomes(terminal, "Simulated modem"));
  EXPECT_TRUE(becomes(terminal, "Operator 001-01"));
}

TEST_F(WatchScreens, tellThatARecordingThatIsTheSourceHasEnded) {
  const Tmux terminal(80, 24, program + "--source recording:" + recording.path() + ",speed=1000");
  EXPECT_TRUE(becomes(terminal, "drive.jsonl, ended"));
  EXPECT_TRUE(becomes(terminal, "PCI 2,"));
}

TEST_F(WatchScreens, openTheSheetOfAField) {
  const Tmux terminal(100, 30, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  terminal.press("Down");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "Serving Cell Info"));
  terminal.press("Down");
  terminal.press("Down");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "phy_cell_id"));
  terminal.press("Down");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "0 to 262143"));
  EXPECT_TRUE(terminal.shows("1815.0 MHz down"));
  EXPECT_TRUE(terminal.shows("0x514"));
  terminal.press("Escape");
  EXPECT_TRUE(becomes(terminal, "tracking_area_code"));
}

TEST_F(WatchScreens, listRecordingsThatCanBeDeletedAndOpened) {
  const std::string data = ::testing::TempDir() + "watch-data-" + std::to_string(::getpid());
  const std::string folder = data + "/qelwatch/recordings";
  std::filesystem::create_directories(folder);
  std::ofstream(folder + "/drive.jsonl") << drive();
  {
    const Tmux terminal(100, 24,
                        "env XDG_DATA_HOME=" + data + " " + program + "--source simulated");
    ASSERT_TRUE(becomes(terminal, "Simulated modem"));
    terminal.press("r");
    ASSERT_TRUE(becomes(terminal, "1 recording,"));
    EXPECT_TRUE(becomes(terminal, "2 cells"));
    terminal.press("d");
    ASSERT_TRUE(becomes(terminal, "0 recordings"));
    terminal.press("u");
    ASSERT_TRUE(becomes(terminal, "2 cells"));
    terminal.press("Enter");
    ASSERT_TRUE(becomes(terminal, "0:00:00 of 0:01:00"));
    terminal.press("c");
    EXPECT_TRUE(eventually([&] { return !terminal.shows("of 0:01:00"); }));
  }
  std::filesystem::remove_all(data);
}

TEST_F(WatchScreens, recordMarkAndKeepWithAKeyEach) {
  const TemporaryFolder data;
  const std::string watch = "env XDG_DATA_HOME=" + data.path() + " " + program;
  const Tmux terminal(80, 24, watch + "--source simulated,speed=20; cat");
  ASSERT_TRUE(becomes(terminal, "R record"));
  terminal.press("R");
  ASSERT_TRUE(becomes(terminal, "Recording 0:00:"));
  EXPECT_TRUE(terminal.shows("Hidden: subscriber and temporary identities"));
  terminal.press("m");
  EXPECT_TRUE(becomes(terminal, "Mark 1"));
  EXPECT_FALSE(terminal.shows("Hidden:")) << "what was said stays";
  terminal.press("r");
  ASSERT_TRUE(becomes(terminal, "being recorded"));
  terminal.press("R");
  ASSERT_TRUE(becomes(terminal, "Kept as "));
  EXPECT_TRUE(becomes(terminal, "1 recording,"));
  EXPECT_TRUE(becomes(terminal, " cell")) << "what is in it is read";
  terminal.press("Escape");
  terminal.press("R");
  ASSERT_TRUE(becomes(terminal, "Recording 0:00:0"));
  ASSERT_TRUE(becomes(terminal, " events, "));
  terminal.press("q");
  EXPECT_TRUE(becomes(terminal, "Kept as ")) << "said on the screen that is given back";
  EXPECT_FALSE(terminal.shows("Simulated modem"));
}

TEST_F(WatchScreens, recordNothingWhereNothingIsLive) {
  const Tmux terminal(80, 24, program + recording.path());
  ASSERT_TRUE(becomes(terminal, "PCI 1,"));
  EXPECT_FALSE(terminal.shows("R record"));
  terminal.press("R");
  terminal.press("n");
  ASSERT_TRUE(becomes(terminal, "PCI 2,"));
  EXPECT_FALSE(terminal.shows("Recording 0:"));
}

TEST_F(WatchScreens, showAValueThatIsCalledLikeItsField) {
  KCellularActivatedBearerContexts report;
  auto bearer = std::make_shared<BearerContext>();
  bearer->setApn("apn");
  report.addBearerContexts(bearer);
  const TemporaryRecording bearers(metricLine(V::K_CELLULAR_ACTIVE_BEARER, report));
  const Tmux terminal(100, 30, program + bearers.path());
  ASSERT_TRUE(becomes(terminal, "0:00:00 of 0:00:00"));
  terminal.press("Down");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "Active Bearers"));
  terminal.press("End");
  terminal.press("Enter");
  ASSERT_TRUE(becomes(terminal, "PDP 0"));
  EXPECT_TRUE(std::regex_search(terminal.screen(), std::regex("apn +apn"))) << terminal.screen();
}

TEST_F(WatchScreens, sayWhatIsMissingWhenThereIsNoService) {
  const Tmux terminal(80, 24, program + "--bus unix:path=/nowhere/bus");
  EXPECT_TRUE(becomes(terminal, "no message bus"));
  terminal.press("s");
  EXPECT_TRUE(becomes(terminal, "No level was reported"));
}

TEST_F(WatchScreens, needNeitherColourNorAKnownCharacterSet) {
  const Tmux terminal(80, 24,
                      "env TERM=vt100 LC_ALL=C TZ=UTC0 " QEL_QELCTL " watch " + recording.path());
  EXPECT_TRUE(becomes(terminal, "good ████·"));
}

}  // namespace
}  // namespace qel::testing
