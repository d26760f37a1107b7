#include "service/InProcessConnector.h"

#include <gmock/gmock.h>

#include <atomic>
#include <functional>
#include <future>
#include <thread>

#include "recording/EventLine.h"
#include "recording/TemporaryFile.h"
#include "service/support/Configuration.h"
#include "service/support/EventLog.h"
#include "tesk/Manager.h"

namespace qel {
namespace {

using namespace service;
using testing::addRequest;
using testing::configuration;
using testing::EventLog;
using testing::queryRequest;
using testing::TemporaryFile;

constexpr std::int64_t kAnyTriggerFirst = 0;
constexpr std::int64_t kQuerySim = 8323091;

Bytes everything() {
  return configuration({{19972}, {19992}, {20005}, {16578}, {54030}, {54017}, {54018}, {20330},
                        {54540}, {54027}, {54035}, {54032}, {54031}, {54537}, {54541}, {53522},
                        {12300}, {53506}, {53507}, {53509}, {53508}, {53523}, {54538}, {54539},
                        {11788}, {53249}, {53250}, {53251}, {53257}, {53260}, {19}},
                       {{kAnyTriggerFirst, 0xFFFFFFFF}});
}

std::shared_ptr<tesk::Connector> connectorTo(const std::string& choice) {
  sources::SourceError error;
  auto connector = makeInProcessConnector(choice, error);
  EXPECT_TRUE(connector) << error.message;
  return connector;
}

void install(tesk::Transport& transport) {
  tesk::Message reply;
  const auto result =
      transport.performCommand(tesk::kCommandAddConfiguration, addRequest(everything()), reply);
  ASSERT_EQ(result.code, 0) << result.message;
}

// A recording of so many triggers, numbered from 0, a millisecond apart.
TemporaryFile numbered(int count) {
  std::string lines;
  for (int i = 0; i < count; ++i) {
    RecordedEvent event;
    event.timeMs = static_cast<std::uint64_t>(1000 + i);
    event.kind = RecordedKind::trigger;
    event.entries = {{tesk::kKeyTriggerID, i}};
    lines += eventLine(event) + "\n";
  }
  return TemporaryFile(".jsonl", lines);
}

std::vector<std::int64_t> numbersIn(const EventLog& log) {
  std::vector<std::int64_t> numbers;
  for (const auto& event : log.events()) {
    numbers.push_back(*event.entries.find(tesk::kKeyTriggerID)->asInt64());
  }
  return numbers;
}

std::vector<std::int64_t> upTo(std::int64_t count) {
  std::vector<std::int64_t> numbers;
  for (std::int64_t i = 0; i < count; ++i) numbers.push_back(i);
  return numbers;
}

TEST(InProcessConnector, BringsTheSimulatedDriveToItsClient) {
  EventLog log;
  const auto transport =
      connectorTo("simulated,speed=1000000,start=1000")->connect("qelwatch", log.sink());
  install(*transport);
  transport->eventsOn();
  ASSERT_TRUE(log.waitFor(500));
  const auto metrics = log.metrics();
  EXPECT_EQ(metrics.front(), 19972) << "the first report is that of the connection's state";
  EXPECT_THAT(metrics, ::testing::IsSupersetOf({16578, 20330, 54030, 54031, 54032, 54540}));
}

TEST(InProcessConnector, EventsWaitUntilSomethingIsConfigured) {
  const auto file = numbered(20);
  EventLog log;
  const auto transport =
      connectorTo("recording:" + file.path() + ",speed=1000000")->connect("qelwatch", log.sink());
  transport->eventsOn();
  install(*transport);
  ASSERT_TRUE(log.waitFor(20));
  EXPECT_EQ(numbersIn(log), upTo(20));
}

TEST(InProcessConnector, NothingIsLostBetweenOffAndOn) {
  const auto file = numbered(3000);
  EventLog log;
  const auto transport =
      connectorTo("recording:" + file.path() + ",speed=1000000")->connect("qelwatch", log.sink());
  install(*transport);
  for (int i = 0; i < 200; ++i) {
    transport->eventsOff();
    transport->eventsOn();
  }
  ASSERT_TRUE(log.waitFor(3000));
  EXPECT_EQ(numbersIn(log), upTo(3000));
}

TEST(InProcessConnector, OffMeansOffWhenTheCallReturns) {
  EventLog log;
  const auto transport =
      connectorTo("simulated,speed=1000000,start=1000")->connect("qelwatch", log.sink());
  install(*transport);
  transport->eventsOn();
  ASSERT_TRUE(log.waitFor(100));
  transport->eventsOff();
  const std::size_t count = log.count();
  std::this_thread::yield();
  EXPECT_EQ(log.count(), count);
  transport->eventsOn();
  EXPECT_TRUE(log.waitFor(count + 100));
}

TEST(InProcessConnector, NoEventComesAfterTheTransportIsGone) {
  const auto connector = connectorTo("simulated,speed=1000000,start=1000");
  for (int i = 0; i < 30; ++i) {
    std::atomic<bool> gone = false;
    std::atomic<int> late = 0;
    EventLog log;
    auto transport = connector->connect(
        "qelwatch", [&, sink = log.sink()](std::string_view stream, tesk::Message event) {
          if (gone) ++late;
          sink(stream, std::move(event));
        });
    install(*transport);
    transport->eventsOn();
    ASSERT_TRUE(log.waitFor(20));
    transport.reset();
    gone = true;
    std::this_thread::yield();
    EXPECT_EQ(late, 0);
  }
}

// A transport takes one call at a time: a sink that makes some waits for the switch to be through.
class ASinkThatActs : public ::testing::Test {
 protected:
  void switchOn(std::function<void()> act) {
    log.whileDelivered = [this, action = std::move(act)] {
      if (_acted.exchange(true)) return;
      _switchedOn.get_future().wait();
      action();
      _done.set_value();
    };
    install(*transport);
    transport->eventsOn();
    _switchedOn.set_value();
    ASSERT_EQ(_done.get_future().wait_for(std::chrono::seconds(30)), std::future_status::ready);
  }

  EventLog log;
  std::unique_ptr<tesk::Transport> transport =
      connectorTo("simulated,speed=1000000,start=1000")->connect("qelwatch", log.sink());

 private:
  std::atomic<bool> _acted = false;
  std::promise<void> _switchedOn;
  std::promise<void> _done;
};

TEST_F(ASinkThatActs, MayEndItsTransportAndTakeEverythingAlong) {
  // The connector is gone already: with the transport go the core, the source and its thread.
  switchOn([this] { transport.reset(); });
  EXPECT_EQ(log.count(), 1U);
}

TEST_F(ASinkThatActs, MayQueryAndSwitchItsEventsOff) {
  std::int32_t code = -1;
  switchOn([&] {
    tesk::Message reply;
    code =
        transport->performCommand(tesk::kCommandQueryMetric, queryRequest(kQuerySim), reply).code;
    transport->eventsOff();
  });
  EXPECT_EQ(code, 0);
  ASSERT_EQ(log.count(), 2U);
  EXPECT_EQ(log.metrics()[1], 19);
}

TEST(InProcessConnector, ADriveBeginsAnewWithTheNextFirstClient) {
  const auto file = numbered(10);
  const auto connector = connectorTo("recording:" + file.path() + ",speed=1000000");
  for (int i = 0; i < 3; ++i) {
    EventLog log;
    const auto transport = connector->connect("qelwatch", log.sink());
    install(*transport);
    transport->eventsOn();
    ASSERT_TRUE(log.waitFor(10));
    EXPECT_EQ(numbersIn(log), upTo(10));
  }
}

TEST(InProcessConnector, ARecordingThatLoopsGoesOn) {
  const auto file = numbered(5);
  EventLog log;
  const auto transport = connectorTo("recording:" + file.path() + ",speed=1000000,loop")
                             ->connect("qelwatch", log.sink());
  install(*transport);
  transport->eventsOn();
  ASSERT_TRUE(log.waitFor(12));
  EXPECT_EQ(numbersIn(log)[5], 0);
  EXPECT_EQ(numbersIn(log)[11], 1);
}

TEST(InProcessConnector, TwoClientsShareOneDrive) {
  const auto connector = connectorTo("simulated,speed=1000000,start=1000");
  EventLog first;
  EventLog second;
  const auto a = connector->connect("one", first.sink());
  const auto b = connector->connect("two", second.sink());
  install(*a);
  install(*b);
  a->eventsOn();
  b->eventsOn();
  ASSERT_TRUE(first.waitFor(300));
  ASSERT_TRUE(second.waitFor(300));
  const auto event = second.events()[200];
  EXPECT_THAT(first.events(), ::testing::Contains(::testing::Field(&EventLog::Event::entries,
                                                                   ::testing::Eq(event.entries))));
}

TEST(InProcessConnector, ClientsComeAndGoFromManyThreads) {
  const auto connector = connectorTo("simulated,speed=1000000,start=1000");
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([&connector, t] {
      for (int i = 0; i < 15; ++i) {
        EventLog log;
        const auto transport = connector->connect("client" + std::to_string(t), log.sink());
        install(*transport);
        transport->eventsOn();
        EXPECT_TRUE(log.waitFor(5));
        tesk::Message reply;
        transport->performCommand(tesk::kCommandQueryMetric, queryRequest(kQuerySim), reply);
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
}

TEST(InProcessConnector, ServesTheClientLibrary) {
  tesk::setConnector(connectorTo("simulated,speed=1000000,start=1000"));
  EventLog log;
  const auto queue = std::make_shared<SerialQueue>("connector test");
  std::weak_ptr<tesk::client::Manager> open;
  {
    const auto manager = tesk::client::CreateManager("qelwatch", queue);
    ASSERT_TRUE(manager);
    open = manager;
    tesk::client::RegisterEventHandler(
        manager, tesk::kEventMetric,
        [sink = log.sink()](const tesk::Message& event, tesk::client::DispatchGroup&) {
          sink(tesk::kEventMetric, event);
        });
    tesk::Message reply;
    EXPECT_EQ(tesk::client::PerformCommand(manager, tesk::kCommandAddConfiguration,
                                           addRequest(everything()), reply)
                  .code,
              0);
    tesk::client::EventsOff(manager);
    tesk::client::EventsOn(manager);
    EXPECT_TRUE(log.waitFor(50));
  }
  // An event on the queue holds the manager for as long as it is handled.
  while (!open.expired()) {
    std::promise<void> handled;
    queue->async([&] { handled.set_value(); });
    handled.get_future().wait();
  }
  tesk::setConnector(nullptr);
}

}  // namespace
}  // namespace qel
