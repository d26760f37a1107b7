#include "sources/Pacer.h"

#include <gmock/gmock.h>

#include <thread>

#include "sources/support/FakeWaitClock.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using sources::Pacer;
using ::testing::ElementsAre;
using testing::FakeWaitClock;
using ::testing::IsEmpty;

TEST(Pacer, LetsTheFirstEventThroughAndTheOthersInTheirTime) {
  FakeWaitClock clock;
  clock.setMs(500);
  Pacer pacer(clock, 1);
  const std::stop_token never;
  EXPECT_TRUE(pacer.wait(1'000'000, never));
  EXPECT_THAT(clock.waits(), IsEmpty());
  EXPECT_TRUE(pacer.wait(1'000'250, never));
  EXPECT_TRUE(pacer.wait(1'002'000, never));
  EXPECT_THAT(clock.waits(), ElementsAre(750, 2500));
}

TEST(Pacer, DividesTimeBySpeed) {
  FakeWaitClock clock;
  Pacer fast(clock, 60);
  const std::stop_token never;
  fast.wait(0, never);
  fast.wait(60'000, never);
  EXPECT_THAT(clock.waits(), ElementsAre(1000));
  FakeWaitClock other;
  Pacer slow(other, 0.5);
  slow.wait(0, never);
  slow.wait(100, never);
  EXPECT_THAT(other.waits(), ElementsAre(200));
}

TEST(Pacer, DoesNotWaitForWhatIsOverdue) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  const std::stop_token never;
  pacer.wait(0, never);
  clock.setMs(5000);
  EXPECT_TRUE(pacer.wait(4000, never));
  EXPECT_THAT(clock.waits(), IsEmpty());
  pacer.wait(6000, never);
  EXPECT_THAT(clock.waits(), ElementsAre(6000)) << "counted from the first, not from the late one";
}

TEST(Pacer, BeginsAnewWhenTimeGoesBack) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  const std::stop_token never;
  pacer.wait(9000, never);
  clock.setMs(100);
  EXPECT_TRUE(pacer.wait(1000, never));
  EXPECT_TRUE(pacer.wait(1300, never));
  EXPECT_THAT(clock.waits(), ElementsAre(400));
}

// Was compared with the event from which time is counted, so that a second round and any step back
// behind that event left everything overdue.
TEST(Pacer, AStepBackBehindTheFirstEventCountsAnewToo) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  const std::stop_token never;
  pacer.wait(1000, never);
  pacer.wait(3000, never);  // at 2000
  EXPECT_TRUE(pacer.wait(1000, never));
  EXPECT_TRUE(pacer.wait(1200, never));
  EXPECT_TRUE(pacer.wait(1100, never));
  EXPECT_TRUE(pacer.wait(1400, never));
  EXPECT_THAT(clock.waits(), ElementsAre(2000, 2200, 2500));
}

// Was as long a silence as the gap.
TEST(Pacer, AGapOfMoreThanAMinutePassesAsASecondAndIsLogged) {
  const testing::CapturedSystemLog systemLog;
  FakeWaitClock clock;
  Pacer pacer(clock, 2);
  const std::stop_token never;
  pacer.wait(1'500'000'000'000, never);
  pacer.wait(1'500'000'060'000, never);  // just short enough
  EXPECT_THAT(systemLog.lines(), IsEmpty());
  pacer.wait(1'500'003'660'000, never);
  pacer.wait(1'500'003'660'200, never);
  EXPECT_THAT(clock.waits(), ElementsAre(30'000, 30'500, 30'600));
  EXPECT_THAT(systemLog.lines(),
              ElementsAre("no event from 1500000060000 to 1500003660000 (ms since 1970): "
                          "the gap passes as 1000 ms"));
}

TEST(Pacer, OnlyTheFirstGapsAreLogged) {
  const testing::CapturedSystemLog systemLog;
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  const std::stop_token never;
  for (std::uint64_t i = 0; i < 100; ++i) pacer.wait(i * 100'000, never);
  ASSERT_EQ(systemLog.lines().size(), 10U);
  EXPECT_THAT(systemLog.lines().back(), ::testing::EndsWith("; further gaps are not logged"));
  EXPECT_EQ(clock.nowMs(), 99'000U);
}

TEST(Pacer, TheLastMomentOfAllIsNoGapThatOverflows) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  const std::stop_token never;
  const std::uint64_t last = ~std::uint64_t{0};
  pacer.wait(last - 70'000, never);
  pacer.wait(last, never);
  pacer.wait(0, never);
  pacer.wait(last, never);
  EXPECT_THAT(clock.waits(), ElementsAre(1000, 2000));
}

TEST(Pacer, EveryRoundBeginsAfterAPause) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1e6);
  const std::stop_token never;
  pacer.wait(5000, never);
  EXPECT_TRUE(pacer.beginRound(never));
  EXPECT_TRUE(pacer.wait(5000, never));
  EXPECT_THAT(clock.waits(), ElementsAre(1000));
  std::stop_source stop;
  stop.request_stop();
  EXPECT_FALSE(pacer.beginRound(stop.get_token()));
}

TEST(Pacer, CountsAnewAfterAPause) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  const std::stop_token never;
  pacer.wait(1000, never);
  clock.setMs(60'000);
  pacer.resume();
  pacer.wait(1100, never);
  pacer.wait(1600, never);
  EXPECT_THAT(clock.waits(), ElementsAre(60'500));
}

TEST(Pacer, AnEndlessWaitStillFitsTheClock) {
  FakeWaitClock clock;
  Pacer pacer(clock, 0.01);
  const std::stop_token never;
  pacer.wait(0, never);
  EXPECT_TRUE(pacer.wait(~std::uint64_t{0}, never));
  ASSERT_EQ(clock.waits().size(), 1U);
  EXPECT_LT(clock.waits()[0], std::uint64_t{1} << 62);
}

TEST(Pacer, SaysWhenItWasStopped) {
  FakeWaitClock clock;
  Pacer pacer(clock, 1);
  std::stop_source stop;
  EXPECT_TRUE(pacer.wait(0, stop.get_token()));
  stop.request_stop();
  EXPECT_FALSE(pacer.wait(0, stop.get_token()));
  EXPECT_FALSE(pacer.wait(100, stop.get_token()));
}

TEST(SteadyWaitClock, WaitsUntilTheMoment) {
  auto& clock = sources::steadyWaitClock();
  const std::uint64_t moment = clock.nowMs() + 20;
  EXPECT_TRUE(clock.waitUntilMs(moment, {}));
  EXPECT_GE(clock.nowMs(), moment);
}

TEST(SteadyWaitClock, AStopEndsTheWait) {
  auto& clock = sources::steadyWaitClock();
  std::stop_source stop;
  bool whole = true;
  std::thread waiting(
      [&] { whole = clock.waitUntilMs(clock.nowMs() + 3'600'000, stop.get_token()); });
  stop.request_stop();
  waiting.join();
  EXPECT_FALSE(whole);
}

}  // namespace
}  // namespace qel
