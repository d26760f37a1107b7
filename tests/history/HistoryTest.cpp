#include "history/History.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "history/Followed.h"

namespace qel {
namespace {

using ::testing::ElementsAre;
using testing::Followed;
using V = MetricValidator;
using Kind = HappeningKind;

constexpr std::uint64_t kStart = 1'500'000'000'000;

Happening mark(std::uint64_t timeMs) {
  Happening happening;
  happening.timeMs = timeMs;
  happening.kind = Kind::mark;
  happening.text = "Mark 1";
  return happening;
}

TEST(History, knowsNothingAtFirst) {
  const History history;
  EXPECT_EQ(history.version(), 0U);
  EXPECT_TRUE(history.happenings().empty());
  EXPECT_FALSE(history.servingCell(kStart));
  EXPECT_FALSE(history.technology(kStart));
  EXPECT_TRUE(history.neighbours(kStart).empty());
  EXPECT_FALSE(history.lastReport(V::K_LTE_RRC_STATE, kStart));
  EXPECT_FALSE(history.periodMs(V::K_LTE_RRC_STATE));
  EXPECT_FALSE(history.lastReceivedMs(kStart));
}

TEST(History, growsItsVersionWithWhateverIsTold) {
  Followed followed;
  followed.lteState(kStart, 1);
  followed.lteState(kStart, 1);
  EXPECT_EQ(followed.history.version(), 2U);
  followed.history.add(mark(kStart));
  EXPECT_EQ(followed.history.version(), 3U);
  followed.feed(kStart, 4711, Bytes{});
  EXPECT_EQ(followed.history.version(), 4U) << "a metric that nobody knows";
}

TEST(History, keepsMarksAmongWhatHappened) {
  Followed followed;
  followed.lteState(kStart, 1);
  followed.history.add(mark(kStart + 1));
  followed.lteState(kStart + 2, 3);
  std::vector<Kind> kinds;
  for (const Happening& one : followed.history.happenings()) kinds.push_back(one.kind);
  EXPECT_THAT(kinds, ElementsAre(Kind::rrc, Kind::mark, Kind::rrc));
  EXPECT_EQ(followed.history.happeningsUntil(kStart + 1), 2U);
}

TEST(History, keepsTheNewestHappenings) {
  History::Limits limits;
  limits.mostHappenings = 10;
  Followed followed(limits);
  for (std::uint32_t i = 0; i < 100; ++i) followed.lteCell(kStart + i, i);
  EXPECT_EQ(followed.history.happenings().size(), 10U);
  EXPECT_EQ(followed.history.happeningsGone(), 90U);
  EXPECT_EQ(followed.history.happenings().front().to->code, 90U);
  for (std::uint32_t i = 100; i < 105; ++i) followed.lteCell(kStart + i, i);
  EXPECT_EQ(followed.history.happenings().size(), 10U);
  EXPECT_EQ(followed.history.happeningsGone(), 95U);
  EXPECT_EQ(followed.history.happenings().front().to->code, 95U);
  EXPECT_EQ(followed.history.happeningsUntil(kStart + 99), 5U);
}

TEST(History, tellsReportsAsOfAMoment) {
  Followed followed;
  for (std::uint64_t i = 0; i < 20; ++i) {
    followed.lteState(kStart + 500 * i, static_cast<std::int32_t>(i % 4));
  }
  const auto report = followed.history.lastReport(V::K_LTE_RRC_STATE, kStart + 1400);
  ASSERT_TRUE(report);
  EXPECT_EQ(report->receivedMs, kStart + 1000);
  EXPECT_EQ(report->row->identifier, V::K_LTE_RRC_STATE);
  EXPECT_EQ(followed.history.lastReceivedMs(kStart + 1400), kStart + 1000);
  EXPECT_EQ(followed.history.lastReceivedMs(kStart + 99'999), kStart + 9500);
}

TEST(History, tellsThePeriodThatIsUsual) {
  Followed followed;
  std::uint64_t timeMs = kStart;
  for (const std::uint64_t distance : {0U, 1000U, 1000U, 60'000U, 1000U, 1010U}) {
    followed.lteState(timeMs += distance, 1);
  }
  EXPECT_EQ(followed.history.periodMs(V::K_LTE_RRC_STATE), 1000U);
  EXPECT_EQ(followed.history.periodMs(V::K_LTE_RRC_STATE, kStart + 1500), 1000U);
  EXPECT_FALSE(followed.history.periodMs(V::K_LTE_RRC_STATE, kStart));
}

TEST(HappeningKinds, haveNamesThatAreFoundAgain) {
  for (const Kind kind : kHappeningKinds) EXPECT_EQ(happeningKindNamed(nameOf(kind)), kind);
  EXPECT_EQ(nameOf(Kind::radioLinkFailure), "radio-link-failure");
  EXPECT_FALSE(happeningKindNamed("nonsense"));
  EXPECT_FALSE(happeningKindNamed(""));
}

}  // namespace
}  // namespace qel
