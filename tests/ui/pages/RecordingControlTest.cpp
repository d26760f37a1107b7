#include "ui/pages/RecordingControl.h"

#include <gtest/gtest.h>

#include "messages/nas.h"
#include "recording/Mark.h"
#include "support/FakeTransport.h"
#include "support/RecordedEvents.h"
#include "support/RecordedLines.h"
#include "tesk/Constants.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;
using Calls = std::vector<std::string>;

struct FixedClock final : Clock {
  std::uint64_t nowMs() const override { return 1'500'000'000'000; }
};

class RecordingControlTest : public ::testing::Test {
 protected:
  RecordingControlTest() { ::setenv("TZ", "UTC0", 1); }

  RecordingControl::Way way() {
    return {std::make_shared<FakeConnector>(service), std::nullopt, Bytes{1, 2, 3}};
  }
  void send(const RecordedEvent& event) { service->send(tesk::kEventMetric, event.entries); }
  std::vector<RecordedEvent> recorded() const { return eventsOf(folder.path() + "/" + kName); }

  const std::string kName = "2017-07-14 02.40.00.jsonl.gz";
  TemporaryFolder folder;
  std::shared_ptr<FakeService> service = std::make_shared<FakeService>();
  FixedClock clock;
  RecordingControl::TimePoint now{1h};
  RecordingControl control{RecordingsFolder(folder.path()), way(), clock, [this] { return now; }};
};

TEST_F(RecordingControlTest, recordsOverAConnectionOfItsOwn) {
  control.start();
  EXPECT_EQ(service->clients, Calls{"qelwatch-record"});
  EXPECT_EQ(service->calls, (Calls{std::string(tesk::kCommandAddConfiguration), "on",
                                   std::string(tesk::kCommandQueryMetric)}));
  EXPECT_EQ(*service->commands[0].request.find(tesk::kKeyPayload)->asBytes(), (Bytes{1, 2, 3}));
  EXPECT_EQ(control.fileName(), kName);
  send(lteCell(0, 7));
  now += 62s;
  control.tick();
  EXPECT_TRUE(control.view().text.starts_with("0:01:02, 1 event, ")) << control.view().text;
  control.stop();
  EXPECT_FALSE(control.view().isRecording);
  EXPECT_EQ(control.view().outcome, "Kept as " + kName + ": 1 event");
  EXPECT_EQ(service->calls.back(), tesk::kCommandClearConfiguration);
  const auto events = recorded();
  ASSERT_EQ(events.size(), 1U);
  EXPECT_EQ(events[0].timeMs, clock.nowMs());
  EXPECT_EQ(events[0].entries, lteCell(0, 7).entries);
}

TEST_F(RecordingControlTest, setsMarksThatAreReadAsTriggers) {
  control.start();
  control.mark();
  EXPECT_EQ(control.view().markText, "Mark 1");
  control.mark();
  control.stop();
  const auto events = recorded();
  ASSERT_EQ(events.size(), 2U);
  EXPECT_EQ(events[1].kind, RecordedKind::trigger);
  EXPECT_EQ(markOf(events[1]), 2U);
}

TEST_F(RecordingControlTest, hidesIdentitiesAndSaysSo) {
  EXPECT_NE(control.view().hiddenText.find("identities"), std::string::npos);
  EXPECT_NE(control.view().hiddenText.find("where the phone was"), std::string::npos);
  KCellularMmCommonInfo message;
  message.setImsi(Bytes{8, 0x09, 0x10, 0x10, 0x21, 0x43, 0x65, 0x87, 0x09});
  const auto event = metricEvent(0, MetricValidator::K_CELLULAR_MM_INFO, message.data());
  control.start();
  send(event);
  control.stop();
  const auto events = recorded();
  ASSERT_EQ(events.size(), 1U);
  const Bytes& kept = *events[0].entries.find(kRecordedPayloadKey)->asBytes();
  EXPECT_NE(kept, message.data());
  EXPECT_TRUE(KCellularMmCommonInfo::initWithData(kept)->hasImsi());
}

TEST_F(RecordingControlTest, keepsNoFileOfNothing) {
  control.start();
  EXPECT_TRUE(folder.has(kName));
  control.stop();
  EXPECT_FALSE(folder.has(kName));
  EXPECT_EQ(control.view().outcome, "Nothing was recorded");
}

TEST_F(RecordingControlTest, saysWhyNothingCanBeRecorded) {
  service->answer = [](std::string_view) {
    return tesk::CommandResult{tesk::kServiceUnreachable, "the service is away"};
  };
  control.start();
  EXPECT_FALSE(control.view().isRecording);
  EXPECT_EQ(control.view().outcome,
            "Nothing can be recorded: the service is away. Nothing was recorded");
  EXPECT_FALSE(folder.has(kName));
}

TEST_F(RecordingControlTest, asksAgainWhenTheServiceIsBack) {
  control.serviceCameBack();
  EXPECT_EQ(service->calls, Calls{});
  control.start();
  service->calls.clear();
  control.serviceCameBack();
  EXPECT_EQ(service->calls[0], tesk::kCommandAddConfiguration);
}

TEST_F(RecordingControlTest, endsWhenTheServiceThatIsBackRefuses) {
  control.start();
  send(lteCell(0, 7));
  service->answer = [](std::string_view) {
    return tesk::CommandResult{tesk::kServiceUnreachable, "too many clients"};
  };
  control.serviceCameBack();
  EXPECT_FALSE(control.view().isRecording);
  EXPECT_EQ(control.view().outcome,
            "Nothing more can be recorded: too many clients. Kept as " + kName + ": 1 event");
  EXPECT_EQ(recorded().size(), 1U);
}

// While the service is waited for, the window handles taps.
TEST_F(RecordingControlTest, stopsOnceTheServiceHasAnswered) {
  service->answer = [this](std::string_view) {
    EXPECT_TRUE(control.view().isRecording);
    control.stop();
    control.start();
    control.mark();
    control.tick();
    control.serviceCameBack();
    return tesk::CommandResult{};
  };
  control.start();
  EXPECT_FALSE(control.view().isRecording);
  EXPECT_EQ(control.view().outcome, "Nothing was recorded");
  EXPECT_EQ(service->clients.size(), 1U);
}

TEST_F(RecordingControlTest, endsWholeAtTheLimitOfTheFolder) {
  RecordingsFolder::Limits limits;
  limits.bytes = 1500;
  limits.leastForOne = 100;
  RecordingControl narrow{RecordingsFolder(folder.path(), limits), way(), clock,
                          [this] { return now; }};
  narrow.start();
  std::size_t sent = 0;
  while (narrow.view().isRecording && sent < 1000) {
    send(lteCell(0, static_cast<std::uint32_t>(sent++)));
    narrow.tick();
  }
  EXPECT_FALSE(narrow.view().isRecording);
  EXPECT_TRUE(narrow.view().outcome.starts_with(
      "Recordings take up the 1.5 kB that they may. Kept as " + kName))
      << narrow.view().outcome;
  EXPECT_EQ(recorded().size(), sent);
}

TEST_F(RecordingControlTest, needsNoTickWhileNothingIsRecorded) {
  EXPECT_EQ(control.untilNextTick(), std::nullopt);
  control.start();
  EXPECT_EQ(control.untilNextTick(), 1000ms);
  control.stop();
  EXPECT_EQ(control.untilNextTick(), std::nullopt);
}

}  // namespace
}  // namespace qel::testing
