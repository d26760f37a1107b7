#include "sources/PacedSource.h"

#include <gmock/gmock.h>

#include <chrono>
#include <condition_variable>
#include <mutex>

#include "service/support/FakeSource.h"
#include "sources/support/FakeWaitClock.h"

namespace qel {
namespace {

using namespace sources;
using testing::FakeWaitClock;
using testing::metricEvent;
using Taken = EventReceiver::Taken;

// So many events, each a second after the one before.
class Counting final : public EventSequence {
 public:
  explicit Counting(std::uint64_t count) : _count(count) {}
  std::optional<SourceEvent> next() override {
    if (_next == _count) return std::nullopt;
    return metricEvent(19972, 1000 * ++_next);
  }
  void passed(const SourceEvent& event) override { _passedMs = event.timeMs; }
  SourceAnswer query(std::uint32_t metric) override {
    return {true, std::to_string(metric), _passedMs, {}};
  }
  SourceCondition condition() const override {
    return {"counting", "", "", std::to_string(_next) + " of " + std::to_string(_count)};
  }

 private:
  std::uint64_t _count;
  std::uint64_t _next = 0;
  std::uint64_t _passedMs = 0;
};

// One event, over and over.
class Looping final : public EventSequence {
 public:
  std::optional<SourceEvent> next() override {
    ++_given;
    return metricEvent(19972, 7000);
  }
  bool beginsAnew() const override { return _given > 1; }
  SourceAnswer query(std::uint32_t /*metric*/) override { return {}; }

 private:
  std::uint64_t _given = 0;
};

class Receiver final : public EventReceiver {
 public:
  Taken take(const SourceEvent& event) override {
    std::unique_lock lock(_mutex);
    ++_offers;
    _changed.notify_all();
    if (!_listening) return Taken::nobodyListens;
    _timesMs.push_back(event.timeMs);
    lock.unlock();
    if (inside) inside();
    return Taken::yes;
  }

  void conditionChanged(const SourceCondition& condition) override {
    const std::lock_guard lock(_mutex);
    _conditions.push_back(condition.model);
    _changed.notify_all();
  }

  std::function<void()> inside;  // on the source's thread

  void listen(bool on) {
    const std::lock_guard lock(_mutex);
    _listening = on;
  }
  bool waitForEvents(std::size_t count) {
    return wait([&] { return _timesMs.size() >= count; });
  }
  bool waitForOffers(std::size_t count) {
    return wait([&] { return _offers >= count; });
  }
  bool waitForConditions(std::size_t count) {
    return wait([&] { return _conditions.size() >= count; });
  }
  std::vector<std::string> conditions() {
    const std::lock_guard lock(_mutex);
    return _conditions;
  }
  std::vector<std::uint64_t> timesMs() {
    const std::lock_guard lock(_mutex);
    return _timesMs;
  }

 private:
  template <class Condition>
  bool wait(Condition condition) {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30), condition);
  }

  std::mutex _mutex;
  std::condition_variable _changed;
  bool _listening = true;
  std::size_t _offers = 0;
  std::vector<std::uint64_t> _timesMs;
  std::vector<std::string> _conditions;
};

std::unique_ptr<PacedSource> sourceOf(std::uint64_t events, WaitClock& clock) {
  return std::make_unique<PacedSource>(
      "counting", [events] { return std::make_unique<Counting>(events); }, 1, clock);
}

class PacedSourceTest : public ::testing::Test {
 protected:
  FakeWaitClock clock;
  std::shared_ptr<Receiver> receiver = std::make_shared<Receiver>();
  std::shared_ptr<ListenerSignal> listeners = std::make_shared<ListenerSignal>();
};

TEST_F(PacedSourceTest, PlaysItsSequenceInTimeAndOrder) {
  const auto source = sourceOf(3, clock);
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(3));
  EXPECT_EQ(receiver->timesMs(), (std::vector<std::uint64_t>{1000, 2000, 3000}));
  EXPECT_EQ(clock.waits(), (std::vector<std::uint64_t>{1000, 2000}));
  EXPECT_EQ(source->description(), "counting");
}

// A recording of one instant that loops was as many events as the machine could make.
TEST_F(PacedSourceTest, PausesBetweenRoundsOfOneInstant) {
  const auto source = std::make_unique<PacedSource>(
      "looping", [] { return std::make_unique<Looping>(); }, 1, clock);
  receiver->inside = [&] {
    if (receiver->timesMs().size() == 4) source->stop();
  };
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(4));
  EXPECT_EQ(clock.waits(), (std::vector<std::uint64_t>{1000, 2000, 3000}));
}

TEST_F(PacedSourceTest, AnEventThatNobodyListensToWaitsForTheNextListener) {
  receiver->listen(false);
  const auto source = sourceOf(3, clock);
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForOffers(1));
  listeners->changed();  // of no use to it
  ASSERT_TRUE(receiver->waitForOffers(2));
  receiver->listen(true);
  listeners->changed();
  ASSERT_TRUE(receiver->waitForEvents(3));
  EXPECT_EQ(receiver->timesMs(), (std::vector<std::uint64_t>{1000, 2000, 3000}));
}

TEST_F(PacedSourceTest, EveryStartBeginsAnew) {
  const auto source = sourceOf(2, clock);
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(2));
  source->stop();
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(4));
  EXPECT_EQ(receiver->timesMs(), (std::vector<std::uint64_t>{1000, 2000, 1000, 2000}));
}

TEST_F(PacedSourceTest, StopsWhileItWaitsForAListener) {
  receiver->listen(false);
  const auto source = sourceOf(3, clock);
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForOffers(1));
  source->stop();
}  // and the destructor returns

TEST_F(PacedSourceTest, StopsWhileItWaitsForAnEventsTime) {
  const auto source = std::make_unique<PacedSource>(
      "slow", [] { return std::make_unique<Counting>(2); }, 0.01, steadyWaitClock());
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(1));
  source->stop();
}

TEST_F(PacedSourceTest, MayBeStoppedFromWithinAnEvent) {
  const auto source = sourceOf(1000, clock);
  receiver->inside = [&] { source->stop(); };
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(1));
}

TEST_F(PacedSourceTest, MayBeDestroyedFromWithinAnEvent) {
  auto source = sourceOf(1000, clock);
  std::atomic<bool> gone = false;
  receiver->inside = [&] {
    source.reset();
    gone = true;
    gone.notify_all();
  };
  source->start(receiver, listeners);
  gone.wait(false);
  EXPECT_EQ(receiver->timesMs().size(), 1U);
}

TEST_F(PacedSourceTest, EndsWhenItsReceiverIsGone) {
  receiver->listen(false);
  const auto source = sourceOf(3, clock);
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForOffers(1));
  receiver.reset();
  listeners->changed();
}

TEST_F(PacedSourceTest, AnswersAQueryAsOfTheEventThatPassedLast) {
  const auto source = sourceOf(3, clock);
  EXPECT_FALSE(source->query(5).known) << "not running";
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForEvents(3));
  const SourceAnswer answer = source->query(5);
  EXPECT_TRUE(answer.known);
  EXPECT_EQ(answer.message, "5");
  EXPECT_EQ(answer.timeMs, 3000U);
}

TEST_F(PacedSourceTest, ManyStartsAndStopsLeaveNothingBehind) {
  const auto source = sourceOf(100, clock);
  for (int i = 0; i < 50; ++i) {
    source->start(receiver, listeners);
    if (i % 3 == 0) source->stop();
  }
}

TEST_F(PacedSourceTest, TellsTheConditionOfItsSequenceAtTheBeginningAndTheEnd) {
  const auto source = sourceOf(2, clock);
  source->start(receiver, listeners);
  ASSERT_TRUE(receiver->waitForConditions(2));
  EXPECT_EQ(receiver->conditions(), (std::vector<std::string>{"0 of 2", "2 of 2"}));
}

}  // namespace
}  // namespace qel
