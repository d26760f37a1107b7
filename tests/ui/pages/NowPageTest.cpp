#include "ui/pages/NowPage.h"

#include <gtest/gtest.h>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "ui/pages/Scene.h"

namespace qel::testing {
namespace {

std::vector<std::string> textsOf(const NowPage& page) {
  std::vector<std::string> texts;
  for (const NowLine& line : page.lines) texts.push_back(line.text);
  return texts;
}

using Texts = std::vector<std::string>;

TEST(NowPage, SaysWhichCellInFiveLines) {
  Scene scene;
  scene.cell({});
  scene.rrc(kConnected);
  KCellularLteCarrierAggregationStatus carriers;
  auto second = std::make_shared<SecondaryComponentCarrier>();
  second->setState(2);
  carriers.addSccList(second);
  auto none = std::make_shared<SecondaryComponentCarrier>();
  none->setState(0);
  carriers.addSccList(none);
  scene.validator.feed(MetricValidator::K_LTE_CA_STATUS, carriers);
  const NowPage page = nowPage(scene.viewpoint(), {});
  EXPECT_EQ(page.reason, "");
  EXPECT_EQ(textsOf(page),
            (Texts{"LTE band 3, 1815.0 MHz", "Operator 262-01", "PCI 123, EARFCN 1300",
                   "TAC 4711, cell 4660·1", "Connected, 2 carriers"}));
  EXPECT_EQ(page.badge, "LTE 3");
  EXPECT_EQ(page.band, "3");
  EXPECT_EQ(page.rrc, "connected");
  EXPECT_EQ(page.carriers, 2U);
  EXPECT_EQ(page.lines[3].spoken, "TAC 4711, eNodeB 4660, sector 1");
}

TEST(NowPage, NamesGsmOnceWhereItsBandDoes) {
  for (const auto& [arfcn, text, badge] :
       {std::tuple{77U, "GSM 900, 950.4 MHz", "GSM 900"},
        std::tuple{600U, "GSM, DCS 1800, 1822.8 MHz", "GSM DCS 1800"}}) {
    Scene scene;
    KCellularGsmScellInfo cell;
    cell.setArfcn(arfcn);
    cell.setMcc(262);
    scene.validator.feed(MetricValidator::K_GSM_SCELL_INFO, cell);
    const NowPage page = nowPage(scene.viewpoint(), {});
    EXPECT_EQ(page.lines[0].text, text);
    EXPECT_EQ(page.badge, badge);
  }
}

TEST(NowPage, KeepsEveryLineInItsPlaceWhenLittleIsKnown) {
  Scene scene;
  scene.rrc(kIdle);
  const NowPage page = nowPage(scene.viewpoint(), {});
  EXPECT_EQ(textsOf(page),
            (Texts{"LTE", "Operator not reported", "Cell code and channel not reported",
                   "Cell identity not reported", "Idle"}));
  EXPECT_FALSE(page.lines[1].isKnown);
  EXPECT_EQ(page.level.figure, "");
  EXPECT_EQ(page.level.spoken, "RSRP not reported");
  EXPECT_FALSE(page.levelDbm);
  EXPECT_FALSE(page.ageMs);
}

TEST(NowPage, GradesLevelQualityAndRatio) {
  Scene scene;
  scene.cell({});
  scene.signal(-86, -12, -3);
  const NowPage page = nowPage(scene.viewpoint(), {});
  EXPECT_EQ(page.level.figure, "-86");
  EXPECT_EQ(page.level.unit, "dBm");
  EXPECT_EQ(page.level.word, "good");
  EXPECT_EQ(page.level.step, 4);
  ASSERT_TRUE(page.quality && page.sinr);
  EXPECT_EQ(page.quality->figure, "-12");
  EXPECT_EQ(page.quality->word, "fair");
  EXPECT_EQ(page.quality->step, 3);
  EXPECT_EQ(page.sinr->figure, "-1.5");
  EXPECT_EQ(page.sinr->word, "poor");
  EXPECT_EQ(page.sinr->spoken, "SINR -1.5 dB, poor");
  EXPECT_EQ(page.levelDbm, -86.0F);
}

TEST(NowPage, TellsTheAgeOfAValueOlderThanTwiceItsPeriod) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 10'000, -90);
  scene.at(12'000);
  NowPage page = nowPage(scene.viewpoint(), {});
  EXPECT_FALSE(page.level.isOld);
  EXPECT_EQ(page.level.age, "");
  EXPECT_EQ(page.changesAtMs, kStartMs + 12'001);
  scene.at(12'001);
  page = nowPage(scene.viewpoint(), {});
  EXPECT_TRUE(page.level.isOld);
  scene.at(27'000);
  page = nowPage(scene.viewpoint(), {});
  EXPECT_EQ(page.level.age, "15 s old");
  EXPECT_EQ(page.ageMs, 17'000U);
  EXPECT_EQ(page.changesAtMs, kStartMs + 30'000);
  EXPECT_EQ(page.level.spoken, "RSRP -90 dBm, good, 15 s old");
}

TEST(NowPage, ChangesByItselfOnlyWhileItIsLive) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 10'000, -90);
  EXPECT_FALSE(nowPage(scene.viewpoint(false), {}).changesAtMs);
}

TEST(NowPage, HasTwoMinutesOfRunsThatStopAtSilences) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 60'000, -90);
  scene.signals(150'000, 200'000, -100);
  const NowPage page = nowPage(scene.viewpoint(), {});
  EXPECT_EQ(page.runsToMs, kStartMs + 200'000);
  EXPECT_EQ(page.runsFromMs, kStartMs + 80'000);
  ASSERT_EQ(page.runs.size(), 1U);
  EXPECT_EQ(page.runs[0].front().timeMs, kStartMs + 150'000);
  scene.at(170'000);
  const NowPage earlier = nowPage(scene.viewpoint(), {});
  ASSERT_EQ(earlier.runs.size(), 2U);
  EXPECT_EQ(earlier.runs[0].back().timeMs, kStartMs + 60'000);
}

TEST(NowPage, ShowsTheMomentAndNothingLater) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 5'000, -90);
  scene.signals(6'000, 10'000, -110);
  scene.at(5'500);
  const NowPage page = nowPage(scene.viewpoint(false), {});
  EXPECT_EQ(page.level.figure, "-90");
}

TEST(NowPage, SaysInASentenceWhyNothingIsKnown) {
  const Scene scene;
  Feed feed;
  EXPECT_EQ(nowPage(scene.viewpoint(), feed).reason, "Searching: no cell has been reported yet.");
  feed.reach = Feed::Reach::notInstalled;
  const NowPage missing = nowPage(scene.viewpoint(), feed);
  EXPECT_EQ(missing.reason, "Baseband manager: not installed.");
  EXPECT_NE(missing.advice, "");
  feed.reach = Feed::Reach::there;
  feed.condition = "No modem";
  feed.state = "absent";
  feed.isWithoutModem = true;
  EXPECT_EQ(nowPage(scene.viewpoint(), feed).reason, "No modem.");
  EXPECT_EQ(nowPage(scene.viewpoint(false), feed).reason,
            "No cell was reported up to this moment.");
}

TEST(NowPage, SaysThatAndWhyTheNetworkRefused) {
  Scene scene;
  Happening refusal;
  refusal.timeMs = kStartMs;
  refusal.kind = HappeningKind::reject;
  refusal.text = "LTE attach rejected: network not allowed (11)";
  scene.history.add(refusal);
  EXPECT_EQ(nowPage(scene.viewpoint(), {}).reason,
            "LTE attach rejected: network not allowed (11).");
}

}  // namespace
}  // namespace qel::testing
