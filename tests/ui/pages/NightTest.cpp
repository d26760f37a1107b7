// A night: the device sleeps for eight hours in four pieces, and wakes for a minute between them.

#include <gtest/gtest.h>

#include "capture/Recorder.h"
#include "history/ToldHappening.h"
#include "support/FixedTimeZone.h"
#include "support/RecordedEvents.h"
#include "support/RecordedLines.h"
#include "tesk/Constants.h"
#include "ui/kit/RunLoop.h"
#include "ui/pages/Freshness.h"
#include "ui/pages/HappeningsPage.h"
#include "ui/pages/NowPage.h"
#include "ui/pages/Scene.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

constexpr int kPieces = 4;
constexpr std::uint64_t kPieceMs = 2 * 3'600'000;
constexpr std::uint64_t kAwakeMs = 60'000;

std::size_t gapsIn(const std::deque<Happening>& happenings) {
  return static_cast<std::size_t>(
      std::ranges::count(happenings, HappeningKind::gap, &Happening::kind));
}

TEST(Night, AgesCountTheSleep) {
  Scene scene;
  scene.cell({});
  std::uint64_t now = 0;
  for (int i = 0; i < kPieces; ++i) {
    scene.signals(now, now + kAwakeMs, -90);
    now += kAwakeMs + kPieceMs;
    scene.at(now);
    const NowPage page = nowPage(scene.viewpoint(), {});
    EXPECT_TRUE(page.level.isOld);
    EXPECT_EQ(page.level.age, "2 h old");
    EXPECT_EQ(page.ageMs, kPieceMs);
    EXPECT_FALSE(freshness({}, scene.viewpoint()).isFlowing);
    scene.signal(-91, -9, 25);
    EXPECT_FALSE(nowPage(scene.viewpoint(), {}).level.isOld);
  }
}

TEST(Night, EverySleepIsOneGapAndNoLineIsDrawnAcrossIt) {
  Scene scene;
  std::uint64_t now = 0;
  for (int i = 0; i <= kPieces; ++i) {
    scene.signals(now, now + kAwakeMs, -90);
    now += kAwakeMs + kPieceMs;
  }
  EXPECT_EQ(gapsIn(scene.history.happenings()), kPieces);
  EXPECT_EQ(scene.history.happenings().back().text, "Nothing was reported for 2 h 0 min");
  const auto runs = scene.history.series(Quantity::lteRsrp).between(kStartMs, kStartMs + now);
  for (const auto& run : runs) EXPECT_LT(run.back().timeMs - run.front().timeMs, kPieceMs);
}

TEST(Night, TimersGoOnWhereTheyStoodAndFireOnce) {
  struct Counter {
    void count() { ++fired; }
    int fired = 0;
  };
  RunLoop loop;
  RunLoop::TimePoint now{1h};
  const auto counter = std::make_shared<Counter>();
  loop.addTimer(std::make_shared<RepeatingTimer>(5s, counter, &Counter::count), now);
  // A steady clock stands still while the device sleeps; one that does not is all the same.
  for (const auto slept : {0ms, std::chrono::milliseconds(kPieceMs)}) {
    counter->fired = 0;
    now += slept + 5s;
    loop.fireDue(now);
    EXPECT_EQ(counter->fired, 1);
    EXPECT_EQ(loop.nextDue(), now + 5s);
  }
}

class RecordedNight : public ::testing::Test {
 protected:
  RecordedNight() {
    std::string error;
    recorder = std::make_unique<capture::Recorder>(
        RotatingRecording::create(file, {}, RotatingRecording::Existing::refused, {}, error),
        nullptr, clock, [this] { return asleep; });
  }

  void report(std::uint32_t code) {
    recorder->take(tesk::kEventMetric, tesk::Message(lteCell(0, code).entries));
  }
  void sleep(std::chrono::milliseconds length) {
    asleep += length;
    clock.timeMs += static_cast<std::uint64_t>(length.count());
  }
  std::vector<RecordedEvent> recorded() {
    EXPECT_TRUE(recorder->close());
    return eventsOf(file);
  }

  const TemporaryFolder folder;
  const std::string file = folder.path() + "/night.jsonl";
  Scene::SetClock clock;
  std::chrono::milliseconds asleep{1h};  // before it was begun
  std::unique_ptr<capture::Recorder> recorder;
};

TEST_F(RecordedNight, SaysThatThereWasAGap) {
  report(1);
  for (int i = 0; i < kPieces; ++i) {
    sleep(std::chrono::milliseconds(kPieceMs));
    recorder->tend();  // whoever wakes first
    report(2);
  }
  const auto events = recorded();
  ASSERT_EQ(events.size(), 1 + 2 * kPieces);
  EXPECT_EQ(sleepOf(events[1]), std::chrono::milliseconds(kPieceMs));
  EXPECT_EQ(events[1].timeMs, kStartMs + kPieceMs);
  EXPECT_FALSE(sleepOf(events[2]));
  const auto told = happeningToldBy(events[1]);
  ASSERT_TRUE(told);
  EXPECT_EQ(told->kind, HappeningKind::gap);
  EXPECT_EQ(told->text, "Nothing was recorded for 2:00:00: the device slept");
}

TEST_F(RecordedNight, TellsTheGapBeforeTheReportThatEndsIt) {
  report(1);
  sleep(10s);
  report(2);
  const auto events = recorded();
  ASSERT_EQ(events.size(), 3U);
  EXPECT_TRUE(sleepOf(events[1]));
}

TEST_F(RecordedNight, CountsTheSleepInTheAgeOfAFile) {
  RecordingLimits limits;
  limits.fileAge = kPieceMs * 1ms;
  std::string error;
  recorder = std::make_unique<capture::Recorder>(
      RotatingRecording::create(folder.path() + "/old.jsonl", limits,
                                RotatingRecording::Existing::refused,
                                std::chrono::steady_clock::now() + asleep, error),
      nullptr, clock, [this] { return asleep; });
  report(1);
  recorder->tend();
  EXPECT_EQ(recorder->progress().filesFinished, 0U);
  sleep(std::chrono::milliseconds(kPieceMs));
  recorder->tend();
  EXPECT_EQ(recorder->progress().filesFinished, 1U);
}

TEST_F(RecordedNight, PassesOverANap) {
  report(1);
  sleep(4999ms);
  report(2);
  EXPECT_EQ(recorded().size(), 2U);
}

TEST_F(RecordedNight, AGapThatIsToldIsNotFoundOnceMore) {
  for (int i = 0; i < 20; ++i) {
    report(1);
    clock.timeMs += 1000;
  }
  sleep(std::chrono::milliseconds(kPieceMs));
  report(1);
  Scene scene;
  for (const RecordedEvent& event : recorded()) {
    scene.clock.timeMs = event.timeMs;
    if (auto told = happeningToldBy(event)) scene.history.add(std::move(*told));
    if (event.kind == RecordedKind::metric) scene.validator.validator->processMetric(event.entries);
  }
  EXPECT_EQ(gapsIn(scene.history.happenings()), 1U);
}

}  // namespace
}  // namespace qel::testing
