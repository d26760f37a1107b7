#include "ui/kit/RunLoop.h"

#include <gtest/gtest.h>

#include <vector>

namespace qel {
namespace {

using std::chrono::milliseconds;
using std::chrono::seconds;

struct Counter {
  void count() { ++fired; }
  int fired = 0;
};

class RunLoopTest : public ::testing::Test {
 protected:
  std::shared_ptr<RepeatingTimer> add(const std::shared_ptr<Counter>& target,
                                      milliseconds interval = seconds(5)) {
    auto timer = std::make_shared<RepeatingTimer>(interval, target, &Counter::count);
    loop.addTimer(timer, now);
    return timer;
  }

  // Lets the time pass and fires what became due, wake-up by wake-up. The number of wake-ups.
  int pass(milliseconds time) {
    const RunLoop::TimePoint end = now + time;
    int wakeUps = 0;
    while (loop.nextDue() && *loop.nextDue() <= end) {
      now = *loop.nextDue();
      loop.fireDue(now);
      ++wakeUps;
    }
    now = end;
    return wakeUps;
  }

  RunLoop loop;
  RunLoop::TimePoint now{};
  std::shared_ptr<Counter> counter = std::make_shared<Counter>();
};

TEST_F(RunLoopTest, firesEveryIntervalAndNotBefore) {
  add(counter);
  pass(milliseconds(4999));
  EXPECT_EQ(counter->fired, 0);
  pass(milliseconds(1));
  EXPECT_EQ(counter->fired, 1);
  pass(seconds(20));
  EXPECT_EQ(counter->fired, 5);
}

TEST_F(RunLoopTest, addingATimerAgainChangesNothing) {
  const auto timer = add(counter);
  loop.addTimer(timer, now);
  pass(seconds(5));
  EXPECT_EQ(counter->fired, 1);
}

TEST_F(RunLoopTest, aThousandTimersOfOneIntervalShareTheirWakeUps) {
  for (int i = 0; i < 1000; ++i) {
    add(counter);
    pass(milliseconds(7));
  }
  counter->fired = 0;
  EXPECT_EQ(pass(seconds(50)), 10);
  EXPECT_EQ(counter->fired, 10'000);
}

TEST_F(RunLoopTest, timersOfOtherIntervalsKeepTheirOwnTime) {
  const auto other = std::make_shared<Counter>();
  add(counter, seconds(5));
  add(other, seconds(2));
  pass(seconds(10));
  EXPECT_EQ(counter->fired, 2);
  EXPECT_EQ(other->fired, 5);
}

TEST_F(RunLoopTest, aSleepThatWasTooLongIsNotMadeUpFor) {
  add(counter);
  now += seconds(60);
  loop.fireDue(now);
  EXPECT_EQ(counter->fired, 1);
  EXPECT_EQ(loop.nextDue(), now + seconds(5));
}

TEST_F(RunLoopTest, aTimerHoldsItsTarget) {
  const std::weak_ptr<Counter> target = counter;
  add(counter);
  counter.reset();
  pass(seconds(5));
  ASSERT_FALSE(target.expired());
  EXPECT_EQ(target.lock()->fired, 1);
}

TEST_F(RunLoopTest, anInvalidatedTimerLetsGoAndIsForgotten) {
  const std::weak_ptr<Counter> target = counter;
  const auto timer = add(counter);
  counter.reset();
  timer->invalidate();
  EXPECT_TRUE(target.expired());
  EXPECT_FALSE(timer->isValid());
  pass(seconds(5));
  EXPECT_FALSE(loop.nextDue());
}

TEST_F(RunLoopTest, aTimerMayEndItself) {
  struct Once {
    void fire() { timer->invalidate(); }
    std::shared_ptr<RepeatingTimer> timer;
  };
  const auto once = std::make_shared<Once>();
  once->timer = std::make_shared<RepeatingTimer>(seconds(1), once, &Once::fire);
  loop.addTimer(once->timer, now);
  pass(seconds(3));
  EXPECT_FALSE(loop.nextDue());
}

TEST_F(RunLoopTest, itsRunnerIsToldOfANewTimer) {
  std::vector<RunLoop::TimePoint> dues;
  loop.setObserver([this, &dues] { dues.push_back(*loop.nextDue()); });
  add(counter);
  EXPECT_EQ(dues, std::vector<RunLoop::TimePoint>{now + seconds(5)});
}

TEST_F(RunLoopTest, withoutTimersNothingIsDue) { EXPECT_FALSE(loop.nextDue()); }

}  // namespace
}  // namespace qel
