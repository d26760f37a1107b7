#include "tesk/Manager.h"

#include <gtest/gtest.h>

#include "support/FakeTransport.h"
#include "tesk/Constants.h"

namespace tesk::client {
namespace {

using qel::Dictionary;
using qel::MainQueue;
using qel::testing::installFakeService;

class ManagerTest : public ::testing::Test {
 protected:
  ~ManagerTest() override { setConnector(nullptr); }

  // A handler that writes what it gets into `events`.
  EventHandler keep(std::string mark) {
    return [this, mark](const Message& event, DispatchGroup&) {
      events.emplace_back(mark, createDictionaryFromMessage(event));
    };
  }

  std::shared_ptr<qel::testing::FakeService> service = installFakeService();
  std::shared_ptr<MainQueue> queue = std::make_shared<MainQueue>();
  std::shared_ptr<Manager> manager = CreateManager("a client", queue);
  std::vector<std::pair<std::string, Dictionary>> events;
};

TEST_F(ManagerTest, connectsUnderItsClientName) {
  EXPECT_EQ(service->clients, std::vector<std::string>{"a client"});
}

TEST_F(ManagerTest, runsHandlersOnItsQueueOnly) {
  RegisterEventHandler(manager, kEventMetric, keep("m"));
  service->send(kEventMetric, {{"a", 1}});
  EXPECT_TRUE(events.empty());
  queue->drain();
  ASSERT_EQ(events.size(), 1U);
  EXPECT_EQ(events[0].second, (Dictionary{{"a", 1}}));
}

TEST_F(ManagerTest, keepsEventStreamsApart) {
  RegisterEventHandler(manager, kEventMetric, keep("m"));
  RegisterEventHandler(manager, kEventTrigger, keep("t"));
  service->send(kEventTrigger, {{"a", 1}});
  service->send("kEventOther", {{"a", 2}});
  queue->drain();
  ASSERT_EQ(events.size(), 1U);
  EXPECT_EQ(events[0].first, "t");
}

TEST_F(ManagerTest, replacesAHandlerThatIsRegisteredAgain) {
  RegisterEventHandler(manager, kEventMetric, keep("first"));
  RegisterEventHandler(manager, kEventMetric, keep("second"));
  service->send(kEventMetric, {});
  queue->drain();
  ASSERT_EQ(events.size(), 1U);
  EXPECT_EQ(events[0].first, "second");
}

TEST_F(ManagerTest, dropsEventsOfAConnectionThatIsGone) {
  RegisterEventHandler(manager, kEventMetric, keep("m"));
  service->send(kEventMetric, {});
  manager.reset();
  service->send(kEventMetric, {});
  queue->drain();
  EXPECT_TRUE(events.empty());
}

// A queue that stood still took every event there was.
TEST_F(ManagerTest, letsNoMoreEventsWaitThanABacklogHolds) {
  RegisterEventHandler(manager, kEventMetric, keep("m"));
  constexpr int kSent = 20'000;
  service->send(kEventMetric, {{"kKeyMetricID", 7}, {"number", -1}});
  for (int i = 0; i < kSent; ++i) {
    service->send(kEventMetric, {{"kKeyMetricID", 1}, {"number", i}});
  }
  queue->drain();
  EXPECT_EQ(events.size(), 4096U);
  EXPECT_EQ(events.size() + DroppedEvents(manager), kSent + 1U);
  EXPECT_EQ(*events.front().second.find("number"), -1) << "the newest of its metric";
  EXPECT_EQ(*events.back().second.find("number"), kSent - 1);
}

TEST_F(ManagerTest, passesSwitchesAndCommandsOn) {
  EventsOff(manager);
  EventsOn(manager);
  service->answer = [](std::string_view) { return CommandResult{7, "why"}; };
  Message request;
  request.setInt64(kKeyAppID, 2);
  Message reply;
  const CommandResult result = PerformCommand(manager, "kCommandAny", request, reply);
  EXPECT_EQ(result.code, 7);
  EXPECT_EQ(result.message, "why");
  EXPECT_EQ(service->calls, (std::vector<std::string>{"off", "on", "kCommandAny"}));
  EXPECT_EQ(service->commands[0].request, (Dictionary{{"kKeyAppID", 2}}));
}

TEST(ManagerWithoutAWay, answersEveryCommandWithACodeAndAMessage) {
  setConnector(nullptr);
  const auto manager = CreateManager("a client", std::make_shared<MainQueue>());
  EXPECT_EQ(manager, nullptr);
  RegisterEventHandler(manager, kEventMetric, {});
  EventsOn(manager);
  EventsOff(manager);
  Message reply;
  const CommandResult result = PerformCommand(manager, kCommandQueryMetric, Message(), reply);
  EXPECT_NE(result.code, 0);
  EXPECT_FALSE(result.message.empty());
}

TEST(Constants, readAsTheirOwnNames) {
  EXPECT_EQ(kEventMetric, "kEventMetric");
  EXPECT_EQ(kKeyMetricID, "kKeyMetricID");
  EXPECT_EQ(kCommandQueryMetric, "kCommandQueryMetric");
}

}  // namespace
}  // namespace tesk::client
