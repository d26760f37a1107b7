#include "ui/pages/Playback.h"

#include <gtest/gtest.h>

#include "connection/TeskWrapper.h"
#include "recording/Mark.h"
#include "support/FakeTransport.h"
#include "support/RecordedLines.h"
#include "support/RecordingSink.h"
#include "tesk/Constants.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

struct FixedClock final : Clock {
  std::uint64_t nowMs() const override { return 777; }
};

// The process has one dispatcher, which stays with the service that it found first.
const std::shared_ptr<FakeService>& theService() {
  static const auto service = installFakeService();
  return service;
}

// A viewer's dispatcher and history, and a recording of ten seconds with three cells and a mark.
class PlaybackTest : public ::testing::Test {
 protected:
  PlaybackTest() {
    static_cast<MetricStore&>(*shown) = MetricStore();
    shown->setObserver(&live, clock);
    recording =
        folder.file("drive.jsonl", lineOf(lteCell(100'000, 1)) + lineOf(lteCell(104'000, 2)) +
                                       lineOf(markEvent(106'000, 1)) + lineOf(lteCell(110'000, 3)));
  }

  ~PlaybackTest() override {
    playback.setOnChanged({});
    playback.close();
    shown->setObserver(nullptr);
  }

  // As the service would send it.
  void sendLive(std::uint32_t code) {
    service->send(tesk::kEventMetric, lteCell(0, code).entries);
    bool done = false;
    shown->mySharedTeskInstance->queue()->async(
        [&done] { MainQueue::shared().async([&done] { done = true; }); });
    EXPECT_TRUE(MainQueue::shared().runUntil([&done] { return done; }, 10s));
  }
  // The code of the cell that the tables show; 0: none.
  std::uint64_t shownCell() const {
    const auto& slot = shown->myLTESCellInfoDict;
    return slot ? *slot->find("phy_cell_id")->asUInt64() : 0;
  }
  void openAll() {
    playback.open(recording);
    while (playback.view().state == PlaybackView::State::opening) playback.tick();
  }

  CapturedSystemLog log;
  CapturedStandardOutput output;
  const std::shared_ptr<FakeService> service = theService();
  std::shared_ptr<MetricValidator> shown = MetricValidator::shared();
  FixedClock clock;
  History live;
  Playback::TimePoint now{1h};
  Playback playback{shown, live, clock, [this] { return now; }};
  TemporaryFolder folder;
  std::string recording;
};

TEST_F(PlaybackTest, showsLiveValuesUntilARecordingIsOpen) {
  sendLive(9);
  EXPECT_EQ(shownCell(), 9U);
  EXPECT_EQ(playback.view().state, PlaybackView::State::live);
  EXPECT_EQ(playback.untilNextTick(), std::nullopt);
  const Viewpoint viewpoint = playback.viewpoint();
  EXPECT_EQ(viewpoint.history, &live);
  EXPECT_EQ(viewpoint.store, shown.get());
  EXPECT_EQ(viewpoint.nowMs, 777U);
  EXPECT_TRUE(viewpoint.isLive);
}

TEST_F(PlaybackTest, showsTheMomentInEveryTable) {
  openAll();
  EXPECT_EQ(playback.view().title, "drive.jsonl");
  EXPECT_EQ(playback.view().positionText, "0:00:00 of 0:00:10");
  EXPECT_EQ(shownCell(), 1U);
  playback.jumpTo(109'999);
  EXPECT_EQ(shownCell(), 2U);
  EXPECT_EQ(playback.view().positionText, "0:00:09 of 0:00:10");
  EXPECT_EQ(playback.viewpoint().nowMs, 109'999U);
  EXPECT_FALSE(playback.viewpoint().isLive);
  playback.jumpToShare(1);
  EXPECT_EQ(shownCell(), 3U);
  EXPECT_EQ(playback.view().position, 1);
  playback.jumpToShare(0.4F);
  EXPECT_EQ(playback.momentMs(), 104'000U);
  playback.step(-1s);
  EXPECT_EQ(shownCell(), 1U);
  playback.step(-1h);
  EXPECT_EQ(playback.momentMs(), 100'000U);
  playback.step(1h);
  EXPECT_EQ(playback.momentMs(), 110'000U);
}

TEST_F(PlaybackTest, keepsLiveEventsAsideAndComesBackToThem) {
  sendLive(8);
  openAll();
  playback.jumpTo(105'000);
  sendLive(9);
  EXPECT_EQ(shownCell(), 2U) << "the recording's";
  EXPECT_EQ(live.happenings().size(), 2U) << "the live history goes on";
  playback.close();
  EXPECT_EQ(shownCell(), 9U);
  EXPECT_EQ(playback.view().state, PlaybackView::State::live);
  EXPECT_EQ(playback.view().title, "");
  sendLive(10);
  EXPECT_EQ(shownCell(), 10U);
  EXPECT_EQ(live.happenings().size(), 3U);
}

TEST_F(PlaybackTest, goesFromHappeningToHappening) {
  openAll();
  EXPECT_TRUE(playback.view().hasNext);
  EXPECT_FALSE(playback.view().hasPrevious);
  playback.toNextHappening();
  EXPECT_EQ(playback.momentMs(), 104'000U);
  playback.toNextHappening();
  EXPECT_EQ(playback.momentMs(), 106'000U) << "the mark";
  playback.toNextHappening();
  EXPECT_EQ(playback.momentMs(), 110'000U);
  EXPECT_FALSE(playback.view().hasNext);
  playback.toPreviousHappening();
  EXPECT_EQ(playback.momentMs(), 106'000U);
}

TEST_F(PlaybackTest, playsAsFastAsItIsTold) {
  openAll();
  EXPECT_EQ(playback.untilNextTick(), std::nullopt);
  playback.play();
  EXPECT_TRUE(playback.view().isPlaying);
  EXPECT_GT(playback.untilNextTick(), 0ms);
  now += 1500ms;
  playback.tick();
  EXPECT_EQ(playback.momentMs(), 101'500U);
  playback.setSpeed(4);
  EXPECT_EQ(playback.view().speed, 5);
  EXPECT_EQ(playback.view().speedText, "5x");
  now += 1s;
  playback.tick();
  EXPECT_EQ(playback.momentMs(), 106'500U);
  now += 100ms;
  playback.pause();
  EXPECT_EQ(playback.momentMs(), 107'000U);
  now += 1h;
  playback.tick();
  EXPECT_EQ(playback.momentMs(), 107'000U);
  EXPECT_EQ(playback.untilNextTick(), std::nullopt);
}

TEST_F(PlaybackTest, isDueOnceItsPauseIsOver) {
  openAll();
  playback.play();
  EXPECT_EQ(playback.untilNextTick(), 100ms);
  now += 40ms;
  EXPECT_EQ(playback.untilNextTick(), 60ms);
  now += 60ms;
  EXPECT_EQ(playback.untilNextTick(), 0ms);
  now += 1s;
  EXPECT_EQ(playback.untilNextTick(), 0ms) << "overdue";
  playback.tick();
  EXPECT_EQ(playback.momentMs(), 101'100U);
  EXPECT_EQ(playback.untilNextTick(), 100ms);
}

TEST_F(PlaybackTest, losesNoTimeBetweenShortTicks) {
  openAll();
  playback.play();
  for (int i = 0; i < 3000; ++i) {
    now += 300us;
    playback.tick();
  }
  EXPECT_EQ(playback.momentMs(), 100'900U);
}

TEST_F(PlaybackTest, stopsAtTheEndAndBeginsAnewFromThere) {
  openAll();
  playback.setSpeed(1000);
  EXPECT_EQ(playback.view().speed, 60);
  playback.play();
  now += 1s;
  playback.tick();
  EXPECT_EQ(playback.momentMs(), 110'000U);
  EXPECT_FALSE(playback.view().isPlaying);
  playback.play();
  EXPECT_EQ(playback.momentMs(), 100'000U);
  EXPECT_EQ(shownCell(), 1U);
}

TEST_F(PlaybackTest, opensInPiecesAndMayBeGivenUp) {
  std::string lines;
  for (unsigned i = 0; i < 5000; ++i) lines += lineOf(lteCell(1000 + i, i % 500));
  const std::string large = folder.file("large.jsonl", lines);
  sendLive(9);
  playback.open(large);
  EXPECT_EQ(playback.untilNextTick(), 0ms);
  EXPECT_EQ(playback.view().progressText, "Opening large.jsonl: 0 %");
  const auto slow = [this] { return now += 5ms; };
  Playback inPieces(shown, live, clock, slow);
  inPieces.open(large);
  inPieces.tick();
  EXPECT_EQ(inPieces.view().state, PlaybackView::State::opening);
  EXPECT_GT(inPieces.view().progress, 0);
  EXPECT_EQ(shownCell(), 9U) << "shown until it is open";
  inPieces.giveUpOpening();
  EXPECT_EQ(inPieces.view().state, PlaybackView::State::live);
  EXPECT_EQ(inPieces.untilNextTick(), std::nullopt);
}

TEST_F(PlaybackTest, saysWhatCannotBeOpenedAndStaysWhereItIs) {
  openAll();
  playback.jumpTo(104'000);
  playback.open(folder.path() + "/none.jsonl");
  EXPECT_NE(playback.view().error, "");
  EXPECT_EQ(playback.view().state, PlaybackView::State::open);
  playback.open(folder.file("empty.jsonl", ""));
  while (playback.view().state == PlaybackView::State::opening) playback.tick();
  EXPECT_EQ(playback.view().error, "empty.jsonl: no event in it");
  EXPECT_EQ(playback.view().title, "drive.jsonl");
  EXPECT_EQ(shownCell(), 2U);
}

TEST_F(PlaybackTest, tellsOfEveryChange) {
  int changes = 0;
  playback.setOnChanged([&changes] { ++changes; });
  openAll();
  const int opened = changes;
  EXPECT_GE(opened, 2);
  playback.tick();
  EXPECT_EQ(changes, opened) << "nothing to do";
  playback.jumpTo(105'000);
  EXPECT_EQ(changes, opened + 1);
}

TEST_F(PlaybackTest, givesTheLiveValuesBackAtItsEnd) {
  sendLive(9);
  {
    Playback other(shown, live, clock, [this] { return now; });
    other.open(recording);
    while (other.view().state == PlaybackView::State::opening) other.tick();
    EXPECT_EQ(shownCell(), 1U);
  }
  EXPECT_EQ(shownCell(), 9U);
}

}  // namespace
}  // namespace qel::testing
