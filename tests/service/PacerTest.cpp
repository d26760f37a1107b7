#include "service/sources/Pacer.h"

#include <gmock/gmock.h>

#include <thread>

#include "service/support/FakeWaitClock.h"

namespace qel {
namespace {

using service::Pacer;
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
  auto& clock = service::steadyWaitClock();
  const std::uint64_t moment = clock.nowMs() + 20;
  EXPECT_TRUE(clock.waitUntilMs(moment, {}));
  EXPECT_GE(clock.nowMs(), moment);
}

TEST(SteadyWaitClock, AStopEndsTheWait) {
  auto& clock = service::steadyWaitClock();
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
