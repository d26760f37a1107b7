#include "sources/diagnostics/LiveMetrics.h"

#include <gtest/gtest.h>

#include "messages/catalogue/KBBMetricUtility.h"
#include "sources/Metrics.h"
#include "support/diagnostics/ServingCell.h"

namespace qel::diagnostics {
namespace {

using namespace std::chrono_literals;
using test::kServingCell;
using test::servingCell;

constexpr std::uint64_t kWallMs = 1'790'000'000'000;

class LiveMetricsTest : public ::testing::Test {
 protected:
  void send(unsigned pci, unsigned radio = 1) { sendLog(kServingCell, servingCell(pci), radio); }
  void sendLog(std::uint16_t code, const Bytes& body, unsigned radio = 1) {
    const auto passed = static_cast<std::uint64_t>((now - begin) / 1ms);
    metrics.atTime(now, kWallMs + passed);
    metrics.log({code, 315'964'800'000 + passed, radio, body});
  }
  // Of GSM: a level of -71 dBm, and one neighbour.
  void sendLevels() {
    sendLog(0x507A, test::BodyWriter().u16(0x10000 - 71 * 16).u8(0));
    sendLog(0x5071,
            test::BodyWriter().u8(1).u16(0x8005).u16(0x10000 - 65 * 16).u8(1).u8(7).zeros(6));
  }
  void pass(std::chrono::milliseconds time) {
    now += time;
    metrics.atTime(now, kWallMs + static_cast<std::uint64_t>((now - begin) / 1ms));
    metrics.refresh();
  }
  std::size_t cells() const {
    std::size_t count = 0;
    for (const sources::SourceEvent& event : events) {
      const Value* number = event.entries.find("kKeyMetricID");
      if (number->asInt64() == std::int64_t{metric::kLteScellInfo} + kMetricEventBase) ++count;
    }
    return count;
  }

  const LiveMetrics::Clock::time_point begin{1h};
  LiveMetrics::Clock::time_point now = begin;
  std::vector<sources::SourceEvent> events;
  LiveMetrics metrics{1, 5s,
                      [this](const sources::SourceEvent& event) { events.push_back(event); }};
};

TEST_F(LiveMetricsTest, TellsAChangeAtOnceWithTheTimeOfTheHost) {
  send(1);
  ASSERT_EQ(cells(), 1U);
  EXPECT_EQ(events[0].timeMs, kWallMs);
  send(1);
  EXPECT_EQ(cells(), 1U);
  send(2);
  EXPECT_EQ(cells(), 2U);
}

TEST_F(LiveMetricsTest, HoldsBackAModemThatChangesItsMindAllTheTime) {
  for (unsigned i = 0; i < 10'000; ++i) send(i % 500);
  EXPECT_EQ(cells(), 20U);
  EXPECT_EQ(metrics.due(), now + 1s);
  pass(1s);
  EXPECT_EQ(cells(), 21U);  // the last of them
  EXPECT_GT(metrics.due(), now + 5s);
}

TEST_F(LiveMetricsTest, RepeatsAValueAfterThePeriodForAsLongAsPacketsCome) {
  for (int i = 0; i < 100; ++i) {
    send(1);
    pass(100ms);
  }
  EXPECT_EQ(cells(), 2U);
  pass(1h);
  const std::size_t before = cells();
  pass(1h);
  EXPECT_EQ(cells(), before);
  EXPECT_EQ(metrics.due(), LiveMetrics::Clock::time_point::max());
}

TEST_F(LiveMetricsTest, ForgetsTheLevelsOfAModemThatGoesQuietWithTwoLooks) {
  sendLevels();
  pass(1s);
  const auto neighbours = [this] {
    return metrics.query(metric::kGsmNeighbours).entries.find("kKeyPayload")->asBytes()->size();
  };
  const std::size_t withOne = neighbours();
  ASSERT_TRUE(metrics.query(metric::kGsmIdleMeasurement).known);
  ASSERT_EQ(metrics.due(), begin + 10'001ms);
  pass((metrics.due() - now) / 1ms * 1ms);
  EXPECT_FALSE(metrics.query(metric::kGsmIdleMeasurement).known);
  EXPECT_EQ(neighbours(), withOne);
  ASSERT_EQ(metrics.due(), begin + 30'001ms);
  pass((metrics.due() - now) / 1ms * 1ms);
  EXPECT_LT(neighbours(), withOne);
  EXPECT_EQ(metrics.due(), LiveMetrics::Clock::time_point::max());
}

TEST_F(LiveMetricsTest, ForgetsLevelsWhileOnlyTheOtherRadioIsHeard) {
  sendLevels();
  for (int i = 0; i < 12; ++i) {
    pass(1s);
    send(1, 2);
  }
  EXPECT_FALSE(metrics.query(metric::kGsmIdleMeasurement).known);
}

TEST_F(LiveMetricsTest, ListensToItsRadioAlone) {
  send(1, 2);
  EXPECT_EQ(cells(), 0U);
  send(1, 0);
  EXPECT_EQ(cells(), 1U);
}

TEST_F(LiveMetricsTest, KnowsNothingOnceItHasForgotten) {
  send(1);
  EXPECT_TRUE(metrics.query(metric::kLteScellInfo).known);
  metrics.forget();
  EXPECT_FALSE(metrics.query(metric::kLteScellInfo).known);
  EXPECT_FALSE(metrics.knowsCell());
  metrics.sendAll();
  EXPECT_EQ(cells(), 1U);
  EXPECT_EQ(metrics.counts().total().understood, 1U);
}

TEST_F(LiveMetricsTest, TellsANewListenerEverything) {
  send(1);
  metrics.sendAll();
  EXPECT_EQ(cells(), 2U);
}

}  // namespace
}  // namespace qel::diagnostics
