#include <gmock/gmock.h>

#include <functional>

#include "service/ServiceCore.h"
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
using testing::EventLog;
using testing::FakeSource;
using testing::FakeSourceState;
using ::testing::HasSubstr;
using testing::kRrcPayload;
using testing::queryRequest;

constexpr std::int64_t kQuerySim = 8323091;
constexpr std::int64_t kQueryRrcState = 0x7F0000 + 19972;

class CommandsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    core->eventsOn(*session);
    source->answer.timeMs = 5;
    source->answer.entries = {{tesk::kKeyMetricID, std::int64_t{3952132}},
                              {tesk::kKeyPayload, kRrcPayload}};
  }
  tesk::CommandResult perform(std::string_view command, const Dictionary& entries) {
    return core->performCommand(*session, command, tesk::Message(entries));
  }
  void expectRefused(std::string_view command, const Dictionary& entries, CommandCode code,
                     const std::string& text) {
    const auto result = perform(command, entries);
    EXPECT_EQ(result.code, static_cast<std::int32_t>(code)) << text;
    EXPECT_THAT(result.message, HasSubstr(text));
    EXPECT_EQ(result.message.find('\n'), std::string::npos);
    EXPECT_EQ(log.count(), 0U);
  }

  std::shared_ptr<FakeSourceState> source = std::make_shared<FakeSourceState>();
  std::shared_ptr<ServiceCore> core = ServiceCore::create(std::make_unique<FakeSource>(source));
  EventLog log;
  std::shared_ptr<Session> session = core->open("qelwatch", log.sink());
};

TEST_F(CommandsTest, AnUnknownCommandIsRefused) {
  expectRefused("", {}, CommandCode::unknownCommand, "unknown command");
  expectRefused("kCommandAddconfiguration", {}, CommandCode::unknownCommand, "unknown command");
}

struct Command {
  std::string_view name;
  Dictionary request;
};

std::vector<Command> goodCommands() {
  return {{tesk::kCommandAddConfiguration, addRequest(configuration({{19972}})).entries()},
          {tesk::kCommandClearConfiguration, clearRequest().entries()},
          {tesk::kCommandQueryMetric, queryRequest(kQueryRrcState).entries()}};
}

TEST_F(CommandsTest, EveryMissingKeyIsNamed) {
  for (const Command& command : goodCommands()) {
    for (const auto& [key, value] : command.request) {
      Dictionary without = command.request;
      without.remove(key);
      expectRefused(command.name, without, CommandCode::missingKey,
                    std::string(key.view()) + " is missing");
    }
  }
}

TEST_F(CommandsTest, ANullInPlaceOfAValueIsAMissingKey) {
  for (const Command& command : goodCommands()) {
    for (const auto& [key, value] : command.request) {
      Dictionary with = command.request;
      with.set(key, Value());
      expectRefused(command.name, with, CommandCode::missingKey,
                    std::string(key.view()) + " is missing");
    }
  }
}

TEST_F(CommandsTest, EveryValueOfAnotherTypeIsNamed) {
  const std::vector<Value> wrong = {Value(true),   Value("2"),          Value(2.0F),
                                    Value(List{}), Value(Dictionary{}), Value(~std::uint64_t{0})};
  for (const Command& command : goodCommands()) {
    for (const auto& [key, value] : command.request) {
      for (const Value& other : wrong) {
        Dictionary with = command.request;
        with.set(key, other);
        expectRefused(command.name, with, CommandCode::wrongType,
                      std::string(key.view()) + " is not ");
      }
    }
  }
}

TEST_F(CommandsTest, DataInPlaceOfANumberAndANumberInPlaceOfDataAreRefused) {
  Dictionary request = addRequest(configuration({{19972}})).entries();
  request.set(tesk::kKeyAppID, Bytes{2});
  expectRefused(tesk::kCommandAddConfiguration, request, CommandCode::wrongType,
                "kKeyAppID is not a 64-bit integer");
  request = addRequest({}).entries();
  request.set(tesk::kKeyPayload, 7);
  expectRefused(tesk::kCommandAddConfiguration, request, CommandCode::wrongType,
                "kKeyPayload is not data");
}

TEST_F(CommandsTest, OnlyPayloadTypeZeroIsSupported) {
  for (Command& command : goodCommands()) {
    if (!command.request.contains(tesk::kKeyPayloadType)) continue;
    command.request.set(tesk::kKeyPayloadType, 1);
    expectRefused(command.name, command.request, CommandCode::unsupportedPayloadType,
                  "kKeyPayloadType 1 is not supported");
  }
}

TEST_F(CommandsTest, FurtherKeysDoNotMatter) {
  for (Command& command : goodCommands()) {
    command.request.set("kKeySomethingElse", "text");
    EXPECT_EQ(perform(command.name, command.request).code, 0);
  }
}

TEST_F(CommandsTest, APayloadThatIsNoConfigurationIsRefused) {
  const std::string prose = "hello world";
  const std::vector<Bytes> payloads = {
      {}, {0x08}, {0x12, 0x7F}, kRrcPayload, Bytes(prose.begin(), prose.end()), {0x08, 0x02}};
  for (const Bytes& payload : payloads) {
    expectRefused(tesk::kCommandAddConfiguration, addRequest(payload).entries(),
                  CommandCode::notAConfiguration, "kKeyPayload is no configuration");
  }
}

TEST_F(CommandsTest, AConfigurationThatAsksForNothingIsRefused) {
  expectRefused(tesk::kCommandAddConfiguration, addRequest(configuration({})).entries(),
                CommandCode::notAConfiguration, "kKeyPayload asks for nothing");
}

TEST_F(CommandsTest, AConfigurationWithAnUnknownMetricIsRefused) {
  expectRefused(tesk::kCommandAddConfiguration,
                addRequest(configuration({{19972}, {4711}})).entries(),
                CommandCode::notAConfiguration, "kKeyPayload names an unknown metric 4711");
}

TEST_F(CommandsTest, AConfigurationWithATriggerRangeUpsideDownIsRefused) {
  expectRefused(tesk::kCommandAddConfiguration, addRequest(configuration({}, {{5, 4}})).entries(),
                CommandCode::notAConfiguration, "with a last before it");
}

TEST_F(CommandsTest, ARefusedConfigurationLeavesTheOldOneInPlace) {
  perform(tesk::kCommandAddConfiguration, addRequest(configuration({{19972}})).entries());
  perform(tesk::kCommandAddConfiguration, addRequest({0x08}).entries());
  source->send(testing::metricEvent(19972));
  EXPECT_EQ(log.count(), 1U);
}

TEST_F(CommandsTest, AQueryDeliversTheMetricBeforeItsResultWhateverTheConfiguration) {
  const auto result = perform(tesk::kCommandQueryMetric, queryRequest(kQueryRrcState).entries());
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(source->queried, 19972U);
  ASSERT_EQ(log.count(), 1U);
  EXPECT_EQ(log.events()[0].stream, tesk::kEventMetric);
  const Dictionary expected = {{tesk::kKeyMetricID, 3952132},
                               {tesk::kKeyPayload, kRrcPayload},
                               {tesk::kKeyProfileID, 0},
                               {tesk::kKeyTriggerRef, 9999},
                               {tesk::kKeyTriggerID, kQueryRrcState}};
  EXPECT_EQ(log.events()[0].entries, expected);
}

TEST_F(CommandsTest, AQueryGoesToTheClientThatAskedAlone) {
  EventLog other;
  const auto second = core->open("another", other.sink());
  core->eventsOn(*second);
  core->performCommand(*second, tesk::kCommandQueryMetric, queryRequest(kQueryRrcState));
  EXPECT_EQ(other.count(), 1U);
  EXPECT_EQ(log.count(), 0U);
}

TEST_F(CommandsTest, TheTriggerOfTheSimFilesAsksForMetric19) {
  source->answer.entries = {{tesk::kKeyMetricID, 0x3C0013}, {tesk::kKeyPayload, Bytes{}}};
  EXPECT_EQ(perform(tesk::kCommandQueryMetric, queryRequest(kQuerySim).entries()).code, 0);
  EXPECT_EQ(source->queried, 19U);
}

TEST_F(CommandsTest, AQueryMayNameItsMetricAgain) {
  for (const std::int64_t metric : {0, 19972, 3952132}) {
    EXPECT_EQ(
        perform(tesk::kCommandQueryMetric, queryRequest(kQueryRrcState, metric).entries()).code, 0);
  }
}

TEST_F(CommandsTest, AQueryForWhatIsNoMetricIsRefused) {
  for (const std::int64_t trigger : {std::int64_t{0}, std::int64_t{19972}, std::int64_t{0x7F0000},
                                     std::int64_t{0x7F0001}, std::int64_t{0x7F0000 + 0x10000 + 19},
                                     std::int64_t{-1}, std::numeric_limits<std::int64_t>::min()}) {
    expectRefused(tesk::kCommandQueryMetric, queryRequest(trigger).entries(),
                  CommandCode::unknownMetric,
                  "kKeyTriggerID " + std::to_string(trigger) + " asks for no known metric");
  }
  expectRefused(tesk::kCommandQueryMetric, queryRequest(kQueryRrcState, 19992).entries(),
                CommandCode::unknownMetric, "kKeyMetricID 19992 is not the metric of");
}

TEST_F(CommandsTest, WhatTheSourceCannotAnswerIsRefusedWithItsWords) {
  source->answer = {false, "not now", 0, {}};
  expectRefused(tesk::kCommandQueryMetric, queryRequest(kQueryRrcState).entries(),
                CommandCode::metricNotAvailable, "not now");
}

TEST_F(CommandsTest, AnAnswerThatNoClientCouldReadIsRefused) {
  const testing::CapturedSystemLog systemLog;
  source->answer.entries.set(tesk::kKeyPayload, Bytes{0x08, 0xFF});
  expectRefused(tesk::kCommandQueryMetric, queryRequest(kQueryRrcState).entries(),
                CommandCode::metricNotAvailable, "undecodable payload of metric 19972");
}

TEST_F(CommandsTest, AnAnswerWithoutContentIsRefused) {
  const testing::CapturedSystemLog systemLog;
  source->answer.entries = {{tesk::kKeyMetricID, std::int64_t{0x3C0000} + 11788},
                            {tesk::kKeyPayload, Bytes{}}};
  expectRefused(tesk::kCommandQueryMetric, queryRequest(0x7F0000 + 11788).entries(),
                CommandCode::metricNotAvailable, "nothing to show in metric 11788");
}

TEST_F(CommandsTest, AQueryWithEventsOffSaysSo) {
  core->eventsOff(*session);
  expectRefused(tesk::kCommandQueryMetric, queryRequest(kQueryRrcState).entries(),
                CommandCode::deliveryOff, "events are off");
}

}  // namespace
}  // namespace qel
