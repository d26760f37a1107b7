#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <future>
#include <thread>

#include "connection/TeskWrapper.h"
#include "support/FakeTransport.h"
#include "support/RecordingSink.h"
#include "tesk/Constants.h"

namespace qel {
namespace {

using namespace std::chrono_literals;
using testing::CapturedSystemLog;
using testing::installFakeService;

struct RecordingDelegate final : TeskWrapperDelegate {
  void metricsDidUpdate(const std::optional<Dictionary>& event) override {
    thread = std::this_thread::get_id();
    metrics.push_back(event.value());
  }
  void eventsDidUpdate(const std::optional<Dictionary>& event) override {
    triggers.push_back(event.value());
  }
  std::vector<Dictionary> metrics;
  std::vector<Dictionary> triggers;
  std::thread::id thread;
};

// Waits until the serial queue has run all that it was given before.
void finishQueue(const std::shared_ptr<TeskWrapper>& wrapper) {
  bool done = false;
  wrapper->queue()->async([&done] { MainQueue::shared().async([&done] { done = true; }); });
  EXPECT_TRUE(MainQueue::shared().runUntil([&done] { return done; }, 10s));
}

class TeskWrapperEvents : public ::testing::Test {
 protected:
  CapturedSystemLog log;
  std::shared_ptr<testing::FakeService> service = installFakeService();
  std::shared_ptr<TeskWrapper> wrapper = TeskWrapper::sharedInstance();
  std::shared_ptr<RecordingDelegate> delegate = std::make_shared<RecordingDelegate>();
  const Dictionary event{{"kKeyMetricID", 3985666}, {"kKeyPayload", Bytes{1, 2}}, {"extra", 5}};
};

TEST_F(TeskWrapperEvents, thereIsOneWrapperAndOneConnection) {
  EXPECT_EQ(TeskWrapper::sharedInstance(), wrapper);
  EXPECT_EQ(service->clients, std::vector<std::string>{"qelwatch"});
  EXPECT_TRUE(service->calls.empty());
  EXPECT_EQ(wrapper->delegate(), nullptr);
}

TEST_F(TeskWrapperEvents, theQueueIsLabelledAndForTheFirstObjectOnly) {
  EXPECT_TRUE(wrapper->queue()->label().ends_with(".serialQ.queue"));
  EXPECT_EQ(TeskWrapper::init()->queue(), nullptr);
}

TEST_F(TeskWrapperEvents, listenSwitchesDeliveryOffAndOnAndSaysSo) {
  wrapper->listen();
  EXPECT_EQ(service->calls, (std::vector<std::string>{"off", "on"}));
  EXPECT_EQ(log.lines(), std::vector<std::string>{"-[TeskWrapper listen]: listening for events"});
}

TEST_F(TeskWrapperEvents, listeningTwiceDeliversEachEventOnce) {
  wrapper->setDelegate(delegate);
  wrapper->listen();
  wrapper->listen();
  EXPECT_EQ(service->calls, (std::vector<std::string>{"off", "on", "off", "on"}));
  service->send(tesk::kEventMetric, event);
  finishQueue(wrapper);
  EXPECT_EQ(delegate->metrics.size(), 1U);
}

TEST_F(TeskWrapperEvents, anEventWithoutADelegateIsOnlyLogged) {
  wrapper->listen();
  log.clear();
  service->send(tesk::kEventTrigger, {{"kKeyTriggerID", 5}});
  finishQueue(wrapper);
  wrapper->setDelegate(delegate);
  finishQueue(wrapper);
  EXPECT_EQ(log.lines(),
            std::vector<std::string>{
                "-[TeskWrapper listen]_block_invoke: EventTrigger dict={\"kKeyTriggerID\": 5}"});
  EXPECT_TRUE(delegate->triggers.empty());
}

TEST_F(TeskWrapperEvents, metricEventsReachTheDelegateWholeOnTheMainThread) {
  wrapper->setDelegate(delegate);
  wrapper->listen();
  log.clear();
  service->send(tesk::kEventMetric, event);
  finishQueue(wrapper);
  ASSERT_EQ(delegate->metrics.size(), 1U);
  EXPECT_EQ(delegate->metrics[0], event);
  EXPECT_EQ(delegate->thread, std::this_thread::get_id());
  EXPECT_TRUE(delegate->triggers.empty());
  EXPECT_EQ(log.lines(),
            std::vector<std::string>{"-[TeskWrapper listen]_block_invoke: MetricsTrigger dict="
                                     "{\"kKeyMetricID\": 3985666, \"kKeyPayload\": \"<0102>\", "
                                     "\"extra\": 5}"});
}

TEST_F(TeskWrapperEvents, triggerEventsReachTheirOwnDelegateMethod) {
  wrapper->setDelegate(delegate);
  wrapper->listen();
  service->send(tesk::kEventTrigger, {{"kKeyTriggerID", 5}});
  finishQueue(wrapper);
  EXPECT_EQ(delegate->triggers, (std::vector<Dictionary>{{{"kKeyTriggerID", 5}}}));
  EXPECT_TRUE(delegate->metrics.empty());
}

TEST_F(TeskWrapperEvents, aDelegateThatGoesAwayBeforeItsTurnIsNotCalled) {
  wrapper->setDelegate(delegate);
  wrapper->listen();
  service->send(tesk::kEventMetric, event);
  // The queue has handed over, the main queue has not run yet.
  std::promise<void> handedOver;
  wrapper->queue()->async([&handedOver] { handedOver.set_value(); });
  handedOver.get_future().wait();
  const std::weak_ptr<RecordingDelegate> watched = delegate;
  delegate.reset();
  EXPECT_TRUE(watched.expired());
  finishQueue(wrapper);
  EXPECT_EQ(wrapper->delegate(), nullptr);
}

// A main thread that was busy let every event wait in memory.
TEST_F(TeskWrapperEvents, eventsThatComeTooFastAreLeftOutAndCounted) {
  constexpr std::uint64_t kSent = 30'000;
  std::uint64_t told = 0;
  wrapper->setLossObserver([&told](std::uint64_t dropped) { told = dropped; });
  wrapper->setDelegate(delegate);
  wrapper->listen();
  log.clear();
  service->send(tesk::kEventMetric, {{"kKeyMetricID", 7}, {"number", -1}});
  for (std::uint64_t i = 0; i < kSent; ++i) {
    service->send(tesk::kEventMetric, {{"kKeyMetricID", 1}, {"number", i}});
  }
  finishQueue(wrapper);
  EXPECT_LE(delegate->metrics.size(), 2 * 4096U + 1) << "in either queue, and one on its way";
  EXPECT_EQ(*delegate->metrics.front().find("number"), -1) << "the newest of its metric";
  EXPECT_EQ(*delegate->metrics.back().find("number"), kSent - 1);
  EXPECT_EQ(delegate->metrics.size() + wrapper->droppedEvents(), kSent + 1);
  EXPECT_EQ(told, wrapper->droppedEvents());
  const auto lines = log.lines();
  const auto isLoss = [](const std::string& line) {
    return line.find("events dropped so far") != std::string::npos;
  };
  EXPECT_EQ(std::ranges::count_if(lines, isLoss), 1) << "one line for all of them";
  wrapper->setLossObserver({});
}

// The queue read the weak pointer while the main thread wrote it, and took a delegate that was
// gone.
TEST_F(TeskWrapperEvents, theDelegateMayBeReplacedWhileEventsArrive) {
  constexpr int kEvents = 2'000;
  wrapper->listen();
  std::atomic<bool> sent = false;
  std::thread sender([this, &sent] {
    for (int i = 0; i < kEvents; ++i) service->send(tesk::kEventMetric, event);
    sent = true;
  });
  while (!sent) {
    wrapper->setDelegate(std::make_shared<RecordingDelegate>());  // gone at once
    wrapper->setDelegate(delegate);
    wrapper->setDelegate(nullptr);
  }
  sender.join();
  wrapper->setDelegate(delegate);
  service->send(tesk::kEventTrigger, {{"kKeyTriggerID", 5}});
  finishQueue(wrapper);
  EXPECT_EQ(delegate->triggers.size(), 1U);
}

}  // namespace
}  // namespace qel
