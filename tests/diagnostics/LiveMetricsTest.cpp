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
  void send(unsigned pci, unsigned radio = 1) {
    const Bytes body = servingCell(pci);
    metrics.atTime(now, kWallMs + static_cast<std::uint64_t>((now - begin) / 1ms));
    metrics.log({kServingCell, 315'964'800'000 + static_cast<std::uint64_t>((now - begin) / 1ms),
                 radio, body});
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
  EXPECT_EQ(metrics.due(), LiveMetrics::Clock::time_point::max());
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
