// What one message may write to the log.

#include <gmock/gmock.h>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/catalogue/TagLog.h"
#include "service/ServiceCore.h"
#include "service/support/Configuration.h"
#include "service/support/EventLog.h"
#include "service/support/FakeSource.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using namespace service;
using testing::addRequest;
using testing::configuration;
using testing::EventLog;
using testing::FakeSource;
using testing::FakeSourceState;
using ::testing::HasSubstr;
using testing::metricEvent;

constexpr std::uint32_t kRrcState = 19972;

// `count` times a tag that is a metric's identifier, with its varint.
Bytes tags(std::size_t count) {
  Bytes bytes;
  for (std::size_t i = 0; i < count; ++i) bytes.insert(bytes.end(), {0x98, 0x01, 0x09});
  return bytes;
}

class TagLogTest : public ::testing::Test {
 protected:
  testing::CapturedSystemLog systemLog;
  std::shared_ptr<FakeSourceState> source = std::make_shared<FakeSourceState>();
  std::shared_ptr<ServiceCore> core = ServiceCore::create(std::make_unique<FakeSource>(source));
  EventLog log;
  std::shared_ptr<Session> session = core->open("qelwatch", log.sink());
};

// Each tag wrote two lines, on the thread that serves everybody: six seconds for one command.
TEST_F(TagLogTest, AConfigurationOfMetricIdentifiersWritesOneLine) {
  Bytes payload = configuration({{kRrcState}});
  const Bytes more = tags(1000);
  payload.insert(payload.end(), more.begin(), more.end());
  for (int i = 0; i < 10; ++i) {
    const auto result =
        core->performCommand(*session, tesk::kCommandAddConfiguration, addRequest(payload));
    EXPECT_EQ(result.code, 0) << result.message;
  }
  ASSERT_EQ(systemLog.lines().size(), 1U);
  EXPECT_THAT(systemLog.lines()[0], HasSubstr("2000 lines about metric identifiers"));
}

TEST_F(TagLogTest, AnEventOfMetricIdentifiersWritesOneLineAndIsDelivered) {
  core->performCommand(*session, tesk::kCommandAddConfiguration,
                       addRequest(configuration({{kRrcState}})));
  core->eventsOn(*session);
  for (int i = 0; i < 3; ++i) source->send(metricEvent(kRrcState, 1000, tags(10'000)));
  EXPECT_EQ(log.count(), 3U);
  EXPECT_EQ(systemLog.lines().size(), 1U);
}

TEST_F(TagLogTest, WhoeverReadsThePayloadAfterwardsWritesEveryLine) {
  ASSERT_TRUE(findMetricMessage(kRrcState)->decode(tags(3)));
  EXPECT_EQ(systemLog.lines().size(), 6U);
}

TEST_F(TagLogTest, TheInnermostCountCounts) {
  const CountedTagLines outer;
  {
    const CountedTagLines inner;
    KBBMetricUtility::isValidMetricIdTag(19, "");
    EXPECT_EQ(inner.count(), 1U);
  }
  KBBMetricUtility::isValidMetricIdTag(19, "");
  EXPECT_EQ(outer.count(), 1U);
  EXPECT_TRUE(systemLog.lines().empty());
}

}  // namespace
}  // namespace qel
