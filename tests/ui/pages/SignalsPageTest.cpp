#include "ui/pages/SignalsPage.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "support/FixedTimeZone.h"
#include "ui/pages/Charts.h"
#include "ui/pages/Scene.h"

namespace qel::testing {
namespace {

const FixedTimeZone kUtc(0, "UTC");

std::vector<std::string> idsOf(const std::vector<Curve>& curves) {
  std::vector<std::string> ids;
  for (const Curve& curve : curves) ids.push_back(curve.id);
  return ids;
}

const Chart& chartOf(const SignalsPage& page, const std::string& id) {
  const auto found = std::ranges::find(page.charts, id, &Chart::id);
  if (found == page.charts.end()) throw std::runtime_error("no chart " + id);
  return *found;
}

using Texts = std::vector<std::string>;

TEST(SignalsPage, HasAFewTimesAtTheEndOfAllTimes) {
  Scene scene;
  Viewpoint viewpoint = scene.viewpoint();
  viewpoint.nowMs = History::kLatest;
  const SignalsPage page = signalsPage(viewpoint, {}, kUtc);
  EXPECT_GT(page.times.size(), 1U);
  EXPECT_LE(page.times.size(), 7U);
}

TEST(SignalsPage, SaysWhatWillAppearWhileNothingDoes) {
  const Scene scene;
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  EXPECT_TRUE(page.charts.empty());
  EXPECT_EQ(page.notice,
            "No level was reported in these 10 minutes. Curves appear with the "
            "reports of the serving cell.");
  EXPECT_EQ(page.neighboursNotice, "No neighbour has been reported lately.");
}

TEST(SignalsPage, DrawsEachQuantityThatWasReported) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 5'000, -90);
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  Texts ids;
  for (const Chart& chart : page.charts) ids.push_back(chart.id);
  EXPECT_EQ(ids, (Texts{"LTE RSRP", "LTE RSRQ", "LTE SINR"}));
  const Chart& level = page.charts.front();
  EXPECT_EQ(idsOf(level.curves), Texts{"serving"});
  ASSERT_EQ(level.curves[0].runs.size(), 1U);
  EXPECT_EQ(level.curves[0].runs[0].size(), 6U);
  EXPECT_EQ(level.newest.figure, "-90");
}

TEST(SignalsPage, LabelsTheAxisAtTheThresholdsOfQuality) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 5'000, -90);
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  Texts labels;
  for (const AxisLabel& label : chartOf(page, "LTE RSRP").labels) {
    labels.push_back(label.text + " " + label.word);
  }
  EXPECT_EQ(labels, (Texts{"-115 poor", "-105 fair", "-95 good", "-85 "}));
}

TEST(SignalsPage, NamesEachGradeOnceBesideTheAxis) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 5'000, -90);
  for (const Chart& chart : signalsPage(scene.viewpoint(), {}, kUtc).charts) {
    Texts words;
    for (const AxisLabel& label : chart.labels) {
      if (!label.word.empty()) words.push_back(label.word);
    }
    EXPECT_EQ(words, (Texts{"poor", "fair", "good"})) << chart.id;
  }
}

TEST(SignalsPage, NeverDrawsAcrossASilence) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 10'000, -90);
  scene.signals(60'000, 70'000, -95);
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  ASSERT_EQ(chartOf(page, "LTE RSRP").curves[0].runs.size(), 2U);
  const ReadOff inGap = readOff(chartOf(page, "LTE RSRP"), kStartMs + 30'000, kUtc);
  EXPECT_TRUE(inGap.values.empty());
  EXPECT_EQ(inGap.spoken, "08:00:30, nothing was reported");
}

TEST(SignalsPage, DrawsTheFiveStrongestNeighboursAndListsAll) {
  Scene scene;
  scene.cell({});
  for (std::uint64_t time = 0; time <= 4'000; time += 1000) {
    scene.at(time);
    scene.signal(-90, -9, 25);
    for (std::uint32_t i = 0; i < 6; ++i) {
      scene.neighbour(200 + i, -93 - static_cast<std::int32_t>(i) * 2);
    }
    scene.reportNeighbours();
  }
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  EXPECT_EQ(idsOf(chartOf(page, "LTE RSRP").curves),
            (Texts{"LTE 1300 200", "LTE 1300 201", "LTE 1300 202", "LTE 1300 203", "LTE 1300 204",
                   "serving"}));
  EXPECT_EQ(chartOf(page, "LTE RSRP").curves[0].label, "PCI 200");
  ASSERT_EQ(page.neighbours.size(), 6U);
  EXPECT_TRUE(page.neighbours[4].hasCurve);
  EXPECT_FALSE(page.neighbours[5].hasCurve);
  const NeighbourRow& strongest = page.neighbours[0];
  EXPECT_EQ(strongest.name, "LTE PCI 200");
  EXPECT_EQ(strongest.channel, "EARFCN 1300");
  EXPECT_EQ(strongest.level, "-93 dBm");
  EXPECT_EQ(strongest.quality, "-12.5 dB");
  EXPECT_EQ(strongest.difference, "-3 dB");
  EXPECT_EQ(strongest.spoken,
            "LTE PCI 200, EARFCN 1300, -93 dBm, -12.5 dB, -3 dB to the serving cell");
}

TEST(SignalsPage, ReadsOffTheServingCellFirstAndThenTheStrongest) {
  Scene scene;
  scene.cell({});
  for (std::uint64_t time = 0; time <= 4'000; time += 1000) {
    scene.at(time);
    scene.signal(-90 - static_cast<std::int32_t>(time / 1000), -9, 25);
    scene.neighbour(201, -88);
    scene.neighbour(200, -99);
    scene.reportNeighbours();
  }
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  const ReadOff off = readOff(chartOf(page, "LTE RSRP"), kStartMs + 2'400, kUtc);
  EXPECT_EQ(off.timeMs, kStartMs + 2'000);
  EXPECT_EQ(off.spoken, "08:00:02, Serving -92 dBm, PCI 201 -88 dBm, PCI 200 -99 dBm");
}

TEST(SignalsPage, StepsFromPointToPoint) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 2'000, -90);
  scene.signals(60'000, 61'000, -90);
  const Chart chart = signalsPage(scene.viewpoint(), {}, kUtc).charts.front();
  EXPECT_EQ(pointAfter(chart, kStartMs + 2'000), kStartMs + 60'000);
  EXPECT_EQ(pointBefore(chart, kStartMs + 60'000), kStartMs + 2'000);
  EXPECT_EQ(pointBefore(chart, kStartMs), std::nullopt);
  EXPECT_EQ(pointAfter(chart, kStartMs + 61'000), std::nullopt);
}

TEST(SignalsPage, MarksHandoversReselectionsAndTheConnection) {
  Scene scene;
  scene.rrc(kIdle);
  scene.cell({});
  scene.signals(0, 1'000, -90);
  scene.at(10'000);
  scene.cell({.pci = 124, .eci = (4660U << 8U) + 2});
  scene.at(20'000);
  scene.rrc(kConnected);
  scene.at(30'000);
  scene.cell({.pci = 125, .eci = (4660U << 8U) + 3});
  const SignalsPage page = signalsPage(scene.viewpoint(), {}, kUtc);
  std::vector<std::pair<std::uint64_t, char>> marks;
  for (const SignalMark& mark : page.marks) {
    if (mark.timeMs > kStartMs) marks.emplace_back(mark.timeMs - kStartMs, mark.letter);
  }
  EXPECT_EQ(marks, (std::vector<std::pair<std::uint64_t, char>>{
                       {10'000, 'R'}, {20'000, 'C'}, {30'000, 'H'}}));
}

TEST(SignalsPage, ShowsTheStretchOfTimeThatIsLookedAt) {
  Scene scene;
  scene.cell({});
  scene.signals(0, 120'000, -90);
  const SignalsRange range{.spanMs = 60'000, .backMs = 30'000, .columns = 0};
  const SignalsPage page = signalsPage(scene.viewpoint(), range, kUtc);
  EXPECT_EQ(page.toMs, kStartMs + 90'000);
  EXPECT_EQ(page.fromMs, kStartMs + 30'000);
  EXPECT_EQ(page.span, "60 seconds to 08:01:30");
  EXPECT_FALSE(page.isAtEnd);
  EXPECT_EQ(chartOf(page, "LTE RSRP").curves[0].runs[0].size(), 61U);
  ASSERT_FALSE(page.times.empty());
  EXPECT_EQ(page.times.front().text, "08:00:30");
}

TEST(SignalsRange, KeepsWhatIsPointedAtInItsPlace) {
  const SignalsRange range{.spanMs = 600'000, .backMs = 0, .columns = 0};
  EXPECT_EQ(range.zoomed(0.5).backMs, 0U);
  const SignalsRange closer = range.zoomed(0.5, 0.5);
  EXPECT_EQ(closer.spanMs, 300'000U);
  EXPECT_EQ(closer.backMs, 150'000U);
  EXPECT_EQ(closer.zoomed(2, 0.5), range);
  EXPECT_EQ(range.zoomed(0.0001).spanMs, SignalsRange::kShortestMs);
  EXPECT_EQ(range.zoomed(1e9).spanMs, SignalsRange::kLongestMs);
  EXPECT_EQ(range.moved(0.5).backMs, 300'000U);
  EXPECT_EQ(range.moved(-3).backMs, 0U);
}

TEST(ThinnedRun, KeepsTheEndsAndExtremesOfEachColumn) {
  qel::Run run;
  for (std::uint64_t i = 0; i < 1000; ++i) run.push_back({i, static_cast<float>(i % 97)});
  const qel::Run kept = thinned(run, 0, 1000, 10);
  EXPECT_LE(kept.size(), 44U);
  EXPECT_EQ(kept.front().timeMs, 0U);
  EXPECT_EQ(kept.back().timeMs, 999U);
  EXPECT_TRUE(std::ranges::is_sorted(kept, {}, &Point::timeMs));
  const auto highest = [](const qel::Run& points) {
    return std::ranges::max_element(points, {}, &Point::value)->value;
  };
  EXPECT_EQ(highest(kept), 96.0F);
}

}  // namespace
}  // namespace qel::testing
