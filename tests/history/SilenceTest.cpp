#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "history/Followed.h"

namespace qel {
namespace {

using ::testing::ElementsAre;
using testing::Followed;
using ::testing::IsEmpty;
using Kind = HappeningKind;

constexpr std::uint64_t kStart = 1'500'000'000'000;

void measure(Followed& followed, std::uint64_t timeMs) {
  KCellularLteRsrpRsrqSinr report;
  auto values = std::make_shared<RsrpRsrqSinr>();
  values->setRsrp0(-90);
  report.setAvgValues(values);
  followed.feed(timeMs, MetricValidator::K_LTE_RSRP_RSRQ_SINR, report);
}

TEST(Silence, isAGapWhenARegularMetricStopsAndNothingElseComes) {
  Followed followed;
  for (std::uint64_t i = 0; i < 10; ++i) measure(followed, kStart + 1000 * i);
  measure(followed, kStart + 9000 + 90'000);
  EXPECT_THAT(followed.texts(Kind::gap), ElementsAre("Nothing was reported for 1 min 30 s"));
  const Happening gap = followed.happenings(Kind::gap)[0];
  EXPECT_EQ(gap.timeMs, kStart + 99'000);
  EXPECT_EQ(gap.metric, MetricValidator::K_LTE_RSRP_RSRQ_SINR) << "the report that ended it";
  EXPECT_FALSE(gap.technology);
  const auto runs = followed.history.series(Quantity::lteRsrp).between(0, kStart + 99'000);
  EXPECT_EQ(runs.size(), 2U);
}

TEST(Silence, isAGapAlsoWhenAReportEndsItThatNobodyHandles) {
  constexpr std::int64_t kNobodys = 3932160 + 4242;
  Followed followed;
  for (std::uint64_t i = 0; i < 10; ++i) measure(followed, kStart + 1000 * i);
  followed.feed(kStart + 9000 + 60'000, kNobodys, Bytes());
  measure(followed, kStart + 9000 + 60'200);
  EXPECT_THAT(followed.texts(Kind::gap), ElementsAre("Nothing was reported for 1 min 0 s"));
  EXPECT_EQ(followed.happenings(Kind::gap)[0].metric, kNobodys);
}

TEST(Silence, ofThreePeriodsOrFiveSecondsIsNone) {
  Followed quick;
  for (std::uint64_t i = 0; i < 100; ++i) measure(quick, kStart + 10 * i);
  measure(quick, kStart + 990 + 5000);
  EXPECT_THAT(quick.texts(Kind::gap), IsEmpty());
  Followed slow;
  for (std::uint64_t i = 0; i < 10; ++i) measure(slow, kStart + 20'000 * i);
  measure(slow, kStart + 180'000 + 60'000);
  EXPECT_THAT(slow.texts(Kind::gap), IsEmpty());
  measure(slow, kStart + 240'000 + 60'001);
  EXPECT_EQ(slow.texts(Kind::gap).size(), 1U);
}

TEST(Silence, meansNothingWhereReportsComeOnlyOnChanges) {
  Followed followed;
  std::uint64_t timeMs = kStart;
  for (const std::uint64_t distance :
       {10U, 40'000U, 300U, 9'000U, 1'000'000U, 77U, 120'000U, 20U}) {
    followed.lteState(timeMs += distance, static_cast<std::int32_t>(distance % 4));
  }
  EXPECT_THAT(followed.texts(Kind::gap), IsEmpty());
}

TEST(Silence, ofTheRegularOneIsNoneWhileOthersCome) {
  Followed followed;
  for (std::uint64_t i = 0; i < 10; ++i) measure(followed, kStart + 1000 * i);
  for (std::uint64_t i = 0; i < 20; ++i) followed.lteCell(kStart + 9000 + 4000 * i, 1);
  measure(followed, kStart + 90'000);
  EXPECT_THAT(followed.texts(Kind::gap), IsEmpty());
}

TEST(Silence, isNotToldTwiceOfALossThatWasTold) {
  Followed followed;
  for (std::uint64_t i = 0; i < 10; ++i) measure(followed, kStart + 1000 * i);
  Happening lost;
  lost.kind = Kind::service;
  lost.timeMs = kStart + 9500;
  lost.text = "Service lost";
  followed.history.add(lost);
  measure(followed, kStart + 99'000);
  EXPECT_THAT(followed.texts(Kind::gap), IsEmpty());
  EXPECT_THAT(followed.texts(Kind::service), ElementsAre("Service lost"));
  EXPECT_EQ(followed.history.series(Quantity::lteRsrp).between(0, kStart + 99'000).size(), 2U);
}

}  // namespace
}  // namespace qel
