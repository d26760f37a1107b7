#include "sources/combined/CombinedSource.h"

#include <gtest/gtest.h>

#include <functional>
#include <thread>
#include <vector>

#include "service/support/FakeSource.h"
#include "sources/combined/CombinedCondition.h"

namespace qel::sources {
namespace {

using testing::FakeSource;
using testing::FakeSourceState;

constexpr std::uint32_t kSignal = 54017;
constexpr std::uint32_t kSimFiles = 19;
constexpr std::uint64_t kStartMs = 1'790'000'000'000;

const SourceCondition kRunning = {"running", "Modem telling", ""};
const SourceCondition kNoPort = {"no-port", "No diagnostics port", ""};
const SourceCondition kRegistered = {"registered", "Registered with a network", "", "EG25"};
const SourceCondition kNoManager = {"no-modem-manager", "ModemManager not running", ""};

// What came through, each metric event as its payload's one byte.
class Heard final : public EventReceiver {
 public:
  Taken take(const SourceEvent& event) override {
    payloads.push_back(event.entries.find(tesk::kKeyPayload)->asBytes()->front());
    if (whileTaken) whileTaken();
    return Taken::yes;
  }
  void conditionChanged(const SourceCondition& condition) override {
    conditions.push_back(condition);
  }

  std::function<void()> whileTaken;
  std::vector<int> payloads;
  std::vector<SourceCondition> conditions;
};

class CombinedSourceTest : public ::testing::Test {
 protected:
  void start(CombinedSource::Port wish = CombinedSource::Port::missed) {
    source = std::make_unique<CombinedSource>(std::make_shared<FakeSource>(port),
                                              std::make_shared<FakeSource>(manager), wish);
    source->start(heard, std::make_shared<ListenerSignal>());
  }

  static void tell(const std::shared_ptr<FakeSourceState>& part, std::uint32_t metric,
                   std::uint8_t value, std::uint64_t seconds = 0) {
    part->receiver.lock()->take(metricEvent(metric, {value}, kStartMs + seconds * 1000));
  }
  static void set(const std::shared_ptr<FakeSourceState>& part, const SourceCondition& condition) {
    part->receiver.lock()->conditionChanged(condition);
  }

  const std::shared_ptr<FakeSourceState> port = std::make_shared<FakeSourceState>();
  const std::shared_ptr<FakeSourceState> manager = std::make_shared<FakeSourceState>();
  const std::shared_ptr<Heard> heard = std::make_shared<Heard>();
  std::unique_ptr<CombinedSource> source;
};

TEST_F(CombinedSourceTest, HearsTheOtherUntilTheBetterOneHasAValue) {
  start();
  tell(manager, kSignal, 1);
  tell(port, kSignal, 2);
  tell(manager, kSignal, 3);
  tell(port, kSignal, 4);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1, 2, 4}));
}

TEST_F(CombinedSourceTest, TakesTheSimFromModemManager) {
  start();
  tell(port, kSimFiles, 1);
  tell(manager, kSimFiles, 2);
  tell(port, kSimFiles, 3);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1, 2}));
}

TEST_F(CombinedSourceTest, GoesOnWithoutAGapWhenThePortIsLost) {
  start();
  set(port, kRunning);
  tell(port, kSignal, 1);
  tell(manager, kSignal, 2);
  tell(manager, kSignal, 3);
  set(port, kNoPort);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1, 3}));
  tell(manager, kSignal, 4);
  set(port, kRunning);
  tell(port, kSignal, 5);
  tell(manager, kSignal, 6);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1, 3, 4, 5}));
}

TEST_F(CombinedSourceTest, GoesOnWithoutAGapWhenModemManagerIsLost) {
  start();
  set(manager, kRegistered);
  tell(manager, kSimFiles, 1);
  tell(port, kSimFiles, 2);
  set(manager, kNoManager);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1, 2}));
}

TEST_F(CombinedSourceTest, TellsNothingOfOneThatIsGone) {
  start();
  set(port, kRunning);
  set(manager, kRegistered);
  tell(port, kSignal, 1);
  tell(manager, kSignal, 2);
  set(manager, kNoManager);
  set(port, kNoPort);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1}));
}

TEST_F(CombinedSourceTest, TellsNothingThatTheOtherDoesNotKnowAnyMore) {
  start();
  set(port, kRunning);
  tell(port, kSignal, 1);
  tell(manager, kSignal, 2);
  manager->answer = {false, "an hour ago", 0, {}};
  set(port, kNoPort);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1}));
}

TEST_F(CombinedSourceTest, TurnsToTheOtherWhenTheBetterOneHasNoValueAnyMore) {
  start();
  tell(manager, kSimFiles, 1);
  tell(port, kSimFiles, 2);
  manager->answer = {false, "not now", 0, {}};
  tell(port, kSimFiles, 3);
  manager->answer = {};
  tell(manager, kSimFiles, 4);
  tell(port, kSimFiles, 5);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1, 3, 4}));
}

TEST_F(CombinedSourceTest, AsksTheBetterOneFirst) {
  start();
  port->answer = {false, "not told", 0, {}};
  manager->answer = {true, "", 5, {}};
  EXPECT_EQ(source->query(kSignal).timeMs, 5U);
  EXPECT_EQ(port->queried, kSignal);
  manager->queried = 0;
  port->answer = {true, "", 6, {}};
  EXPECT_EQ(source->query(kSignal).timeMs, 6U);
  EXPECT_EQ(manager->queried, 0U);
  EXPECT_EQ(source->query(kSimFiles).timeMs, 5U);
}

TEST_F(CombinedSourceTest, SaysHowItIsInOneSentence) {
  start();
  set(manager, kRegistered);
  set(port, kNoPort);
  EXPECT_EQ(inWords(heard->conditions.back()), "Registered with a network: No diagnostics port");
  EXPECT_EQ(heard->conditions.back().state, "registered");
  EXPECT_EQ(heard->conditions.back().model, "EG25");
  set(port, kRunning);
  EXPECT_EQ(inWords(heard->conditions.back()), "Registered with a network");
  set(manager, kNoManager);
  EXPECT_EQ(inWords(heard->conditions.back()), "Modem telling: ModemManager not running");
  EXPECT_EQ(heard->conditions.back().state, "running");
  set(port, kNoPort);
  EXPECT_EQ(inWords(heard->conditions.back()), "ModemManager not running: No diagnostics port");
}

TEST_F(CombinedSourceTest, DoesNotMissAPortThatWasNotAskedFor) {
  start(CombinedSource::Port::welcome);
  set(manager, kRegistered);
  set(port, kNoPort);
  EXPECT_EQ(inWords(heard->conditions.back()), "Registered with a network");
}

TEST_F(CombinedSourceTest, TellsAndHearsNothingOnceItIsStopped) {
  start();
  const auto late = port->receiver.lock();
  source->stop();
  EXPECT_EQ(port->stops, 1);
  EXPECT_EQ(manager->stops, 1);
  late->take(metricEvent(kSignal, {1}, kStartMs));
  late->conditionChanged(kRunning);
  EXPECT_TRUE(heard->payloads.empty());
  EXPECT_TRUE(heard->conditions.empty());
}

TEST_F(CombinedSourceTest, MayBeStoppedFromWithinAnEventWhileTheOtherPartWaits) {
  start();
  const auto other = manager->receiver.lock();
  std::thread waiting;
  heard->whileTaken = [&] {
    waiting = std::thread([&] { other->take(metricEvent(kSimFiles, {2}, kStartMs)); });
    source->stop();
    waiting.join();
  };
  tell(port, kSignal, 1);
  EXPECT_EQ(heard->payloads, (std::vector<int>{1}));
}

}  // namespace
}  // namespace qel::sources
