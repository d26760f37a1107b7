#include "history/Series.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

constexpr std::uint64_t kMinute = 60 * 1000;
constexpr std::uint64_t kHour = 60 * kMinute;
constexpr std::uint64_t kStart = 1'500'000'000'000;

std::size_t pointsIn(const std::vector<Run>& runs) {
  std::size_t points = 0;
  for (const auto& run : runs) points += run.size();
  return points;
}

TEST(Series, isEmptyAtFirst) {
  const Series series;
  EXPECT_TRUE(series.empty());
  EXPECT_TRUE(series.between(0, ~std::uint64_t{0}).empty());
  EXPECT_FALSE(series.last(kStart));
}

TEST(Series, answersForBothEndsOfATime) {
  Series series;
  for (std::uint64_t i = 0; i < 5; ++i)
    series.add(kStart + 1000 * i, -90.0F - static_cast<float>(i));
  const auto runs = series.between(kStart + 1000, kStart + 3000);
  ASSERT_EQ(runs.size(), 1U);
  ASSERT_EQ(runs[0].size(), 3U);
  EXPECT_EQ(runs[0].front().timeMs, kStart + 1000);
  EXPECT_EQ(runs[0].back().value, -93);
  EXPECT_TRUE(series.between(kStart + 3000, kStart + 1000).empty());
}

TEST(Series, tellsTheNewestPointAsOfAnyMoment) {
  Series series;
  series.add(kStart, -90);
  series.add(kStart + 1000, -91);
  EXPECT_FALSE(series.last(kStart - 1));
  EXPECT_EQ(series.last(kStart)->value, -90);
  EXPECT_EQ(series.last(kStart + 999)->value, -90);
  EXPECT_EQ(series.last(kStart + kHour)->value, -91);
}

TEST(Series, beginsARunAfterASilence) {
  Series series;
  for (std::uint64_t i = 0; i < 10; ++i) series.add(kStart + 1000 * i, -90);
  series.add(kStart + 9000 + 5000, -90);  // as long as is usual
  series.add(kStart + 14000 + 5001, -90);
  EXPECT_EQ(series.between(0, kStart + kHour).size(), 2U);
}

TEST(Series, takesLongDistancesForUsualWhereAllAre) {
  Series series;
  for (std::uint64_t i = 0; i < 10; ++i) series.add(kStart + 10'000 * i, -90);
  // Before three were known they were silences.
  EXPECT_EQ(series.between(kStart + 40'000, kStart + kHour).size(), 1U);
  series.add(kStart + 90'000 + 30'001, -90);
  EXPECT_EQ(series.between(kStart + 40'000, kStart + kHour).size(), 2U);
}

TEST(Series, beginsARunWhereItIsInterrupted) {
  Series series;
  series.add(kStart, -90);
  series.interrupt();
  series.add(kStart + 10, -91);
  series.add(kStart + 20, -92);
  const auto runs = series.between(0, kStart + kHour);
  ASSERT_EQ(runs.size(), 2U);
  EXPECT_EQ(runs[1].size(), 2U);
}

TEST(Series, takesATimeThatGoesBackForTheLastOne) {
  Series series;
  series.add(kStart + 1000, -90);
  series.add(kStart, -91);
  EXPECT_EQ(series.last(kStart + 1000)->value, -91);
  EXPECT_FALSE(series.last(kStart + 999));
}

TEST(Series, thinsWhatIsOlderThanTenMinutesToMeans) {
  Series series;
  for (std::uint64_t i = 0; i <= 3600; ++i) series.add(kStart + 1000 * i, i % 2 ? -80 : -90);
  const auto runs = series.between(0, kStart + kHour);
  ASSERT_EQ(runs.size(), 1U) << "the means and the points are one line";
  const auto recent = pointsIn(series.between(kStart + kHour - 10 * kMinute, kStart + kHour));
  EXPECT_EQ(recent, 601U);
  const auto old = series.between(kStart, kStart + 30 * kMinute);
  EXPECT_EQ(pointsIn(old), 60U);
  EXPECT_NEAR(old.at(0).at(7).value, -85, 0.5);
  for (const auto& run : runs) {
    for (std::size_t i = 1; i < run.size(); ++i) EXPECT_GT(run[i].timeMs, run[i - 1].timeMs);
  }
}

TEST(Series, drawsNoThinnedLineAcrossASilence) {
  Series series;
  for (std::uint64_t i = 0; i < 600; ++i) series.add(kStart + 1000 * i, -90);
  const std::uint64_t later = kStart + kHour;
  for (std::uint64_t i = 0; i < 1200; ++i) series.add(later + 1000 * i, -70);
  const auto runs = series.between(0, later + kHour);
  ASSERT_EQ(runs.size(), 2U);
  EXPECT_EQ(runs[0].front().value, -90);
  EXPECT_EQ(runs[0].back().value, -90);
  EXPECT_EQ(runs[1].front().value, -70);
}

TEST(Series, forgetsWhatIsOlderThanADay) {
  Series series;
  for (std::uint64_t i = 0; i < 40 * 120; ++i) series.add(kStart + 30'000 * i, -90);
  const std::uint64_t end = kStart + 40 * kHour;
  EXPECT_EQ(pointsIn(series.between(0, end - 26 * kHour)), 0U);
  EXPECT_GT(pointsIn(series.between(end - 24 * kHour, end)), 2800U);
}

TEST(Series, keepsNoMorePointsThanItMay) {
  Series::Limits limits;
  limits.mostRecent = 1000;
  limits.dayMs = 0;
  Series series(limits);
  for (std::uint64_t i = 0; i < 10'000; ++i) series.add(kStart + i, -90);
  EXPECT_LE(pointsIn(series.between(0, kStart + kHour)), 1000U + 64U);
  EXPECT_EQ(series.last(kStart + kHour)->timeMs, kStart + 9999);
}

}  // namespace
}  // namespace qel
