// What clients may install, at most.

#include <gmock/gmock.h>

#include "service/Limits.h"
#include "service/ServiceCore.h"
#include "service/support/Configuration.h"
#include "service/support/EventLog.h"
#include "service/support/FakeKeeper.h"
#include "service/support/FakeSource.h"

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
using testing::triggers;

class DayClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 1'700'000'000'000;
};

class ConfigurationLimitsTest : public ::testing::Test {
 protected:
  std::shared_ptr<Session> open(const std::string& name) { return core->open(name, log.sink()); }
  tesk::CommandResult install(Session& client, std::int64_t application, Bytes payload) {
    return core->performCommand(client, tesk::kCommandAddConfiguration,
                                addRequest(std::move(payload), application));
  }
  void expectRefused(const tesk::CommandResult& result, CommandCode code, const char* text) {
    EXPECT_EQ(result.code, static_cast<std::int32_t>(code)) << result.message;
    EXPECT_THAT(result.message, HasSubstr(text));
    EXPECT_EQ(result.message.find('\n'), std::string::npos);
  }
  // Eight clients with eight applications each, from 100 on.
  void fill() {
    for (int number = 0; number < 8; ++number) {
      fillers.push_back(open("filler " + std::to_string(number)));
      for (int i = 0; i < 8; ++i) {
        ASSERT_EQ(install(*fillers.back(), 100 + number * 8 + i, small).code, 0);
      }
    }
  }

  const Bytes small = configuration({{19972}});
  DayClock clock;
  std::shared_ptr<FakeSourceState> source = std::make_shared<FakeSourceState>();
  std::shared_ptr<ServiceCore> core =
      ServiceCore::create(std::make_unique<FakeSource>(source), clock);
  EventLog log;
  std::vector<std::shared_ptr<Session>> fillers;
  std::shared_ptr<Session> session = open("qelwatch");
};

// Two megabytes of triggers took sixty times as much memory and ended the service.
TEST_F(ConfigurationLimitsTest, ALargePayloadIsRefusedUnread) {
  expectRefused(install(*session, 2, Bytes(limits::kPayloadBytes + 1, 0xFF)),
                CommandCode::configurationTooLarge,
                "kKeyPayload has 4097 bytes, at most 4096 are taken");
  expectRefused(install(*session, 2, triggers(500'000)), CommandCode::configurationTooLarge,
                "kKeyPayload has ");
  EXPECT_TRUE(core->configurationSizes().empty());
}

TEST_F(ConfigurationLimitsTest, AsManyEntriesAsAreStatedAreTakenAndNoMore) {
  EXPECT_EQ(install(*session, 2, triggers(limits::kConfigurationEntries)).code, 0);
  expectRefused(install(*session, 2, triggers(limits::kConfigurationEntries + 1)),
                CommandCode::configurationTooLarge,
                "kKeyPayload has 513 entries, at most 512 are taken");
}

TEST_F(ConfigurationLimitsTest, ARefusedConfigurationLeavesTheOneBeforeInPlace) {
  ASSERT_EQ(install(*session, 2, small).code, 0);
  EXPECT_NE(install(*session, 2, triggers(2000)).code, 0);
  EXPECT_EQ(core->configurationSizes(), (std::map<std::int64_t, std::uint32_t>{{2, 1}}));
}

// One client with many applications held as much memory as it liked.
TEST_F(ConfigurationLimitsTest, AClientHasEightApplications) {
  for (int i = 0; i < 8; ++i) ASSERT_EQ(install(*session, i, small).code, 0);
  expectRefused(install(*session, 8, small), CommandCode::tooManyConfigurations,
                "kKeyAppID 8 is one too many: a client may install configurations of 8");
  EXPECT_EQ(install(*session, 3, triggers(2)).code, 0) << "one of its own";
  core->performCommand(*session, tesk::kCommandClearConfiguration, clearRequest(5));
  EXPECT_EQ(install(*session, 8, small).code, 0);
}

TEST_F(ConfigurationLimitsTest, AllClientsTogetherHaveSixtyFourApplications) {
  fill();
  expectRefused(install(*session, 2, small), CommandCode::tooManyConfigurations,
                "kKeyAppID 2 finds no room: configurations of at most 64 applications and "
                "131072 bytes are kept");
  EXPECT_EQ(core->configurationSizes().size(), limits::kApplications);
}

TEST_F(ConfigurationLimitsTest, AllPayloadsTogetherAreBound) {
  std::size_t installed = 0;
  for (int number = 0; number < 8; ++number) {
    const auto one = open("client " + std::to_string(number));
    for (int i = 0; i < 8; ++i) {
      const Bytes payload = triggers(500, 0xFFFFFFFF);  // 8 bytes each
      if (install(*one, number * 8 + i, payload).code == 0) installed += payload.size();
    }
  }
  EXPECT_LE(installed, limits::kAllPayloadBytes);
  EXPECT_GT(installed, limits::kAllPayloadBytes - limits::kPayloadBytes);
  expectRefused(install(*session, 99, triggers(500, 0xFFFFFFFF)),
                CommandCode::tooManyConfigurations, "finds no room");
}

TEST_F(ConfigurationLimitsTest, ThoseOfClientsLongGoneGiveWay) {
  fill();
  for (const auto& filler : fillers) core->close(filler);
  EXPECT_NE(install(*session, 2, small).code, 0);
  clock.timeMs += limits::kLongGoneMs;
  EXPECT_EQ(install(*session, 2, small).code, 0);
  EXPECT_EQ(core->configurationSizes().size(), limits::kApplications);
}

TEST_F(ConfigurationLimitsTest, ThoseOfClientsThatAreThereNeverGiveWay) {
  fill();
  clock.timeMs += 10 * limits::kLongGoneMs;
  EXPECT_NE(install(*session, 2, small).code, 0);
}

}  // namespace
}  // namespace qel
