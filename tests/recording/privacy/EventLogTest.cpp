// What becomes of events in a log. Every payload went to the system log, identities in hex.

#include "recording/privacy/EventLog.h"

#include <gtest/gtest.h>

#include "base/Rendering.h"
#include "messages/nas.h"
#include "support/RecordingSink.h"

namespace qel::testing {
namespace {

constexpr std::int64_t kMmCommonInfo = 3986697;
constexpr std::int64_t kRadioLinkFailure = 3952165;  // has no message class
constexpr std::string_view kText = "MetricsTrigger dict=";

const Bytes kImsi = {8, 0x09, 0x10, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98};

Dictionary metric(std::int64_t identifier, Bytes payload) {
  return {{"kKeyMetricID", identifier}, {"kKeyProfileID", 0}, {"kKeyPayload", std::move(payload)}};
}

Bytes payloadWithImsi() {
  KCellularMmCommonInfo message;
  message.setTimestamp(5);
  message.setImsi(kImsi);
  return message.data();
}

class EventLogTest : public ::testing::Test {
 protected:
  std::string logged(EventLog& log, const Dictionary& event) const {
    lines->clear();
    log.writeEvent(kText, event);
    return lines->lines().size() == 1 ? lines->lines()[0] : "no line";
  }

  std::shared_ptr<RecordingSink> lines = std::make_shared<RecordingSink>();
};

TEST_F(EventLogTest, hasEveryLineThatIsNoEvent) {
  for (const std::string& name : loggedEventsNames()) {
    lines->clear();
    EventLog log(lines, *loggedEventsNamed(name));
    log.write("listening for events");
    EXPECT_EQ(lines->lines(), std::vector<std::string>{"listening for events"}) << name;
  }
}

TEST_F(EventLogTest, hasEventsInFullWhenItIsToldTo) {
  EventLog log(lines, LoggedEvents::full);
  EXPECT_EQ(logged(log, metric(kMmCommonInfo, Bytes{0x0a, 0x1b})),
            "MetricsTrigger dict={\"kKeyMetricID\": 3986697, \"kKeyProfileID\": 0, "
            "\"kKeyPayload\": \"<0a1b>\"}");
}

TEST_F(EventLogTest, hasNoEventsWhenItIsToldTo) {
  EventLog log(lines, LoggedEvents::none);
  EXPECT_EQ(logged(log, metric(kMmCommonInfo, payloadWithImsi())), "no line");
}

TEST_F(EventLogTest, hasPseudonymsForIdentities) {
  EventLog log(lines, LoggedEvents::hidden);
  const Dictionary event = metric(kMmCommonInfo, payloadWithImsi());
  const std::string line = logged(log, event);
  EXPECT_EQ(line.find("10325476"), std::string::npos) << line;
  EXPECT_EQ(line.size(), (std::string(kText) + jsonText(event)).size());
  EXPECT_EQ(line, logged(log, event)) << "the same each time";
}

TEST_F(EventLogTest, leavesOutWhatNobodyCanJudge) {
  EventLog log(lines, LoggedEvents::hidden);
  const std::string bare = "MetricsTrigger dict={\"kKeyMetricID\": 3986697, \"kKeyProfileID\": 0}";
  EXPECT_EQ(logged(log, metric(kMmCommonInfo, Bytes{0x08, 0xFF})), bare) << "undecodable";
  Dictionary named = metric(kMmCommonInfo, Bytes{0x08, 0xFF});
  named.append("name", "somebody");
  EXPECT_EQ(logged(log, named), bare);
  EXPECT_EQ(logged(log, metric(kRadioLinkFailure, kImsi)).find("10325476"), std::string::npos);
  EXPECT_EQ(logged(log, {{"kKeyTriggerID", 5}, {"name", "somebody"}}),
            "MetricsTrigger dict={\"kKeyTriggerID\": 5}");
}

TEST_F(EventLogTest, isToldByName) {
  EXPECT_EQ(loggedEventsNamed("hidden"), LoggedEvents::hidden);
  EXPECT_EQ(loggedEventsNamed("some"), std::nullopt);
}

}  // namespace
}  // namespace qel::testing
