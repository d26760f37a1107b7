#include "service/ServiceCore.h"

#include <gmock/gmock.h>

#include "service/support/Configuration.h"
#include "service/support/EventLog.h"
#include "service/support/FakeSource.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using namespace service;
using testing::addRequest;
using testing::clearRequest;
using testing::configuration;
using ::testing::ElementsAre;
using testing::EventLog;
using testing::FakeSource;
using testing::FakeSourceState;
using ::testing::HasSubstr;
using testing::metricEvent;
using testing::triggerEvent;
using Taken = sources::EventReceiver::Taken;

constexpr std::uint32_t kRrcState = 19972;
constexpr std::uint32_t kCdrxConfig = 19992;
constexpr std::uint32_t kRadioLinkFailure = 20005;

class FakeClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 0;
};

class ServiceCoreTest : public ::testing::Test {
 protected:
  std::shared_ptr<Session> listener(EventLog& events, const char* name = "qelwatch") {
    auto session = core->open(name, events.sink());
    core->eventsOn(*session);
    return session;
  }
  void install(Session& session, Bytes payload, std::int64_t application = 2) {
    const auto result = core->performCommand(session, tesk::kCommandAddConfiguration,
                                             addRequest(std::move(payload), application));
    ASSERT_EQ(result.code, 0) << result.message;
  }

  FakeClock clock;
  std::shared_ptr<FakeSourceState> source = std::make_shared<FakeSourceState>();
  std::shared_ptr<ServiceCore> core =
      ServiceCore::create(std::make_unique<FakeSource>(source), clock);
  EventLog log;
};

TEST_F(ServiceCoreTest, DeliversTheMetricsThatAreConfiguredAsTheyAre) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  const sources::SourceEvent event = metricEvent(kRrcState);
  EXPECT_EQ(source->send(event), Taken::yes);
  ASSERT_EQ(log.count(), 1U);
  EXPECT_EQ(log.events()[0].stream, tesk::kEventMetric);
  EXPECT_EQ(log.events()[0].entries, event.entries);
}

TEST_F(ServiceCoreTest, KeepsBackMetricsThatAreNotConfigured) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  EXPECT_EQ(source->send(metricEvent(kCdrxConfig, 1000, {})), Taken::yes);
  EXPECT_EQ(log.count(), 0U);
  EXPECT_EQ(core->status().droppedByConfiguration, 1U);
}

TEST_F(ServiceCoreTest, RoutesTriggersByTheirRanges) {
  const auto session = listener(log);
  install(*session, configuration({}, {{10, 12}, {20, 20}}));
  for (const std::int64_t trigger : {9, 10, 12, 13, 19, 20, 21}) {
    source->send(triggerEvent(trigger));
  }
  ASSERT_EQ(log.count(), 3U);
  EXPECT_EQ(log.events()[0].stream, tesk::kEventTrigger);
  EXPECT_EQ(log.events()[2].entries, (Dictionary{{tesk::kKeyTriggerID, 20}}));
}

TEST_F(ServiceCoreTest, DeliversNothingBeforeEventsAreOnAndAfterTheyAreOff) {
  const auto session = core->open("qelwatch", log.sink());
  install(*session, configuration({{kRrcState}}));
  core->eventsOn(*session);
  source->send(metricEvent(kRrcState));
  core->eventsOff(*session);
  EXPECT_EQ(source->send(metricEvent(kRrcState)), Taken::nobodyListens);
  core->eventsOn(*session);
  source->send(metricEvent(kRrcState));
  EXPECT_EQ(log.count(), 2U);
}

TEST_F(ServiceCoreTest, AnEventThatNobodyListensToIsNotCountedAsReceived) {
  const auto session = listener(log);
  EXPECT_EQ(source->send(metricEvent(kRrcState)), Taken::nobodyListens);
  EXPECT_EQ(core->status().received, 0U);
}

TEST_F(ServiceCoreTest, AnInstalledConfigurationReplacesTheOneBefore) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  install(*session, configuration({{kCdrxConfig}}));
  source->send(metricEvent(kRrcState));
  source->send(metricEvent(kCdrxConfig, 1000, {}));
  EXPECT_THAT(log.metrics(), ElementsAre(kCdrxConfig));
}

TEST_F(ServiceCoreTest, AfterAClearNothingIsDelivered) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  EXPECT_EQ(core->performCommand(*session, tesk::kCommandClearConfiguration, clearRequest()).code,
            0);
  EXPECT_EQ(source->send(metricEvent(kRrcState)), Taken::nobodyListens);
  EXPECT_EQ(log.count(), 0U);
}

TEST_F(ServiceCoreTest, ClearingWhatWasNeverInstalledIsNoError) {
  const auto session = listener(log);
  EXPECT_EQ(core->performCommand(*session, tesk::kCommandClearConfiguration, clearRequest(77)).code,
            0);
}

TEST_F(ServiceCoreTest, TwoApplicationsEachGetWhatTheyAskedFor) {
  EventLog other;
  const auto first = listener(log);
  const auto second = listener(other, "another");
  install(*first, configuration({{kRrcState}}), 2);
  install(*second, configuration({{kCdrxConfig}}), 3);
  source->send(metricEvent(kRrcState));
  source->send(metricEvent(kCdrxConfig, 1000, {}));
  EXPECT_THAT(log.metrics(), ElementsAre(kRrcState));
  EXPECT_THAT(other.metrics(), ElementsAre(kCdrxConfig));
}

TEST_F(ServiceCoreTest, TwoClientsOfOneApplicationBothGetItsEvents) {
  EventLog other;
  const auto first = listener(log);
  const auto second = listener(other, "another");
  install(*first, configuration({{kRrcState}}));
  install(*second, configuration({{kRrcState}, {kCdrxConfig}}));
  source->send(metricEvent(kCdrxConfig, 1000, {}));
  EXPECT_EQ(log.count(), 1U);
  EXPECT_EQ(other.count(), 1U);
}

TEST_F(ServiceCoreTest, AClientThatComesBackUnderItsNameKeepsItsApplication) {
  auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  core->close(session);
  EventLog again;
  const auto back = listener(again);
  EXPECT_EQ(source->send(metricEvent(kRrcState)), Taken::yes);
  EXPECT_EQ(again.count(), 1U);
  EXPECT_EQ(log.count(), 0U);
}

TEST_F(ServiceCoreTest, AnotherClientDoesNotInheritAnApplication) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  EventLog other;
  const auto stranger = listener(other, "stranger");
  source->send(metricEvent(kRrcState));
  EXPECT_EQ(other.count(), 0U);
}

TEST_F(ServiceCoreTest, AMetricWithAPeriodIsThinnedOutByEventTime) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState, 1000}}));
  for (const std::uint64_t timeMs : {5000U, 5400U, 5999U, 6000U, 6100U, 9000U}) {
    source->send(metricEvent(kRrcState, timeMs));
  }
  EXPECT_EQ(log.count(), 3U);
  EXPECT_EQ(core->status().droppedByConfiguration, 3U);
}

TEST_F(ServiceCoreTest, ASourceThatBeginsAnewIsNotThinnedOut) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState, 1000}}));
  source->send(metricEvent(kRrcState, 9000));
  source->send(metricEvent(kRrcState, 100));
  EXPECT_EQ(log.count(), 2U);
}

TEST_F(ServiceCoreTest, AnUndecodablePayloadReachesNobodyAndIsCounted) {
  const testing::CapturedSystemLog systemLog;
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  EXPECT_EQ(source->send(metricEvent(kRrcState, 1000, {0x08, 0xFF})), Taken::yes);
  EXPECT_EQ(log.count(), 0U);
  EXPECT_EQ(core->status().undecodable, 1U);
  EXPECT_EQ(core->status().received, 1U);
  ASSERT_EQ(systemLog.lines().size(), 1U);
  EXPECT_THAT(systemLog.lines()[0],
              HasSubstr("undecodable payload of metric 19972 (KCellularLteRrcState)"));
}

TEST_F(ServiceCoreTest, EventsWithoutTheirIdentifierOrWithAPayloadThatIsNoBytesReachNobody) {
  const testing::CapturedSystemLog systemLog;
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}, {{0, 0xFFFFFFFF}}));
  const std::string_view metric = tesk::kEventMetric;
  source->send({1, metric, {}});
  source->send({1, metric, {{tesk::kKeyMetricID, "3952132"}}});
  source->send({1, metric, {{tesk::kKeyMetricID, kRrcState}, {tesk::kKeyPayload, Bytes{}}}});
  source->send({1, metric, {{tesk::kKeyMetricID, 0x3C4E04}, {tesk::kKeyPayload, "08"}}});
  source->send({1, tesk::kEventTrigger, {{"other", 1}}});
  EXPECT_EQ(log.count(), 0U);
  EXPECT_EQ(core->status().undecodable, 5U);
}

// It was dropped here and an empty message to a replay.
TEST_F(ServiceCoreTest, AMetricWithoutAPayloadIsAnEmptyMessage) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  const sources::SourceEvent event{1, tesk::kEventMetric, {{tesk::kKeyMetricID, 0x3C4E04}}};
  EXPECT_EQ(source->send(event), Taken::yes);
  ASSERT_EQ(log.count(), 1U);
  EXPECT_EQ(log.events()[0].entries, event.entries);
}

// Such a report ended the viewer when its table was opened.
TEST_F(ServiceCoreTest, AReportWithoutContentReachesNobodyIsCountedAndSaidOnce) {
  const testing::CapturedSystemLog systemLog;
  const auto session = listener(log);
  install(*session, configuration({{20330}, {11788}}));
  EXPECT_EQ(source->send(metricEvent(20330, 1000, {0x08, 0x01})), Taken::yes);  // a time alone
  EXPECT_EQ(source->send(metricEvent(11788, 1000, {})), Taken::yes);
  EXPECT_EQ(source->send({1, tesk::kEventMetric, {{tesk::kKeyMetricID, 0x3C0000 + 11788}}}),
            Taken::yes);
  EXPECT_EQ(log.count(), 0U);
  EXPECT_EQ(core->status().received, 3U);
  EXPECT_EQ(core->status().withoutContent, 3U);
  EXPECT_EQ(core->status().undecodable, 0U);
  ASSERT_EQ(systemLog.lines().size(), 1U);
  EXPECT_THAT(systemLog.lines()[0],
              HasSubstr("nothing to show in metric 20330 (KCellularLteRsrpRsrqSinr)"));
}

TEST_F(ServiceCoreTest, AMetricWithoutMessageClassPassesAsItIs) {
  const auto session = listener(log);
  install(*session, configuration({{kRadioLinkFailure}}));
  source->send(metricEvent(kRadioLinkFailure, 1000, {0xFF, 0xFF}));
  EXPECT_EQ(log.count(), 1U);
}

TEST_F(ServiceCoreTest, ComplainsAtMostOnceInTenSecondsAndSaysHowOften) {
  const testing::CapturedSystemLog systemLog;
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  const auto bad = metricEvent(kRrcState, 1000, {0x08, 0xFF});
  clock.timeMs = 100'000;
  for (int i = 0; i < 5; ++i) source->send(bad);
  clock.timeMs = 109'999;
  source->send(bad);
  EXPECT_EQ(systemLog.lines().size(), 1U);
  clock.timeMs = 110'000;
  source->send(bad);
  ASSERT_EQ(systemLog.lines().size(), 2U);
  EXPECT_THAT(systemLog.lines()[1], HasSubstr("and 5 before it"));
  clock.timeMs = 50;  // set back
  source->send(bad);
  EXPECT_EQ(systemLog.lines().size(), 3U);
}

TEST_F(ServiceCoreTest, TheSourceRunsFromTheFirstListenerToTheLastSession) {
  const auto first = core->open("first", log.sink());
  EXPECT_EQ(source->starts, 0);
  core->eventsOn(*first);
  EXPECT_EQ(source->starts, 1);
  EXPECT_TRUE(core->status().sourceRunning);
  core->eventsOff(*first);
  core->eventsOn(*first);
  EXPECT_EQ(source->starts, 1);
  const auto second = core->open("second", log.sink());
  core->eventsOn(*second);
  core->close(first);
  EXPECT_EQ(source->stops, 0);
  core->close(second);
  EXPECT_EQ(source->stops, 1);
  EXPECT_FALSE(core->status().sourceRunning);
  EventLog again;
  const auto third = listener(again);
  EXPECT_EQ(source->starts, 2);
}

TEST_F(ServiceCoreTest, ASwitchOnAfterTheCloseDoesNothing) {
  const auto session = core->open("first", log.sink());
  core->close(session);
  core->eventsOn(*session);
  EXPECT_EQ(source->starts, 0);
}

TEST_F(ServiceCoreTest, TellsTheSourceWhenSomeoneBeginsToListen) {
  const auto session = listener(log);
  const auto before = source->listeners->generation();
  install(*session, configuration({{kRrcState}}));
  EXPECT_NE(source->listeners->generation(), before);
}

TEST_F(ServiceCoreTest, StatusCountsForCoreAndSession) {
  EventLog other;
  const auto session = listener(log);
  const auto off = core->open("silent", other.sink());
  install(*session, configuration({{kRrcState}}));
  source->send(metricEvent(kRrcState));
  source->send(metricEvent(kCdrxConfig, 1000, {}));
  core->performCommand(*session, "kCommandNoSuchThing", {});
  const CoreStatus status = core->status();
  EXPECT_EQ(status.source, "a fake");
  EXPECT_EQ(status.received, 2U);
  EXPECT_EQ(status.delivered, 1U);
  EXPECT_EQ(status.droppedByConfiguration, 1U);
  EXPECT_EQ(status.droppedWhileOff, 2U);
  EXPECT_EQ(status.commands, 2U);
  EXPECT_EQ(status.refusedCommands, 1U);
  ASSERT_EQ(status.sessions.size(), 2U);
  EXPECT_EQ(status.sessions[0].clientName, "qelwatch");
  EXPECT_EQ(status.sessions[0].application, 2);
  EXPECT_TRUE(status.sessions[0].eventsOn);
  EXPECT_EQ(status.sessions[0].delivered, 1U);
  EXPECT_EQ(status.sessions[0].droppedByConfiguration, 1U);
  EXPECT_EQ(status.sessions[1].application, std::nullopt);
  EXPECT_FALSE(status.sessions[1].eventsOn);
  EXPECT_EQ(status.sessions[1].droppedWhileOff, 2U);
}

TEST_F(ServiceCoreTest, ASinkMayCloseItsOwnSession) {
  auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  log.whileDelivered = [&] { core->close(session); };
  source->send(metricEvent(kRrcState));
  EXPECT_EQ(source->send(metricEvent(kRrcState)), Taken::nobodyListens);
  EXPECT_EQ(log.count(), 1U);
  EXPECT_TRUE(core->status().sessions.empty());
}

TEST_F(ServiceCoreTest, ASinkMaySendCommands) {
  const auto session = listener(log);
  install(*session, configuration({{kRrcState}}));
  log.whileDelivered = [&] {
    core->performCommand(*session, tesk::kCommandClearConfiguration, clearRequest());
  };
  source->send(metricEvent(kRrcState));
  EXPECT_EQ(source->send(metricEvent(kRrcState)), Taken::nobodyListens);
}

TEST_F(ServiceCoreTest, KnowsTheConditionOfTheModemWhileTheSourceRuns) {
  const sources::SourceCondition locked = {"locked", "Modem locked", "SIM PIN needed"};
  EXPECT_EQ(core->condition().current(), sources::SourceCondition());
  const auto session = listener(log);
  source->receiver.lock()->conditionChanged(locked);
  EXPECT_EQ(core->condition().current(), locked);
  core->close(session);
  EXPECT_EQ(core->condition().current(), sources::SourceCondition());
  source->receiver.lock()->conditionChanged(locked);
  EXPECT_EQ(core->condition().current(), sources::SourceCondition());
}

}  // namespace
}  // namespace qel
