#include "history/Journal.h"

#include <gtest/gtest.h>

#include "metrics/MetricValidator.h"

namespace qel {
namespace {

constexpr std::uint64_t kStart = 1'500'000'000'000;
constexpr std::int64_t kState = MetricValidator::K_LTE_RRC_STATE;
constexpr std::int64_t kCell = MetricValidator::K_LTE_SCELL_INFO;

const DispatchRow& row(std::int64_t metric) { return *findDispatchRow(metric); }

Bytes bytesOf(const JournalEntry& entry) { return {entry.payload.begin(), entry.payload.end()}; }

Bytes filled(std::size_t size, std::uint8_t with) { return Bytes(size, with); }

TEST(Journal, givesBackEveryPayloadAsItCame) {
  Journal journal;
  const std::vector<std::size_t> sizes = {0, 1, 2046, 2047, 2048, 40'000, 3};
  for (std::size_t i = 0; i < sizes.size(); ++i) {
    journal.add(row(kState), kStart + i, filled(sizes[i], static_cast<std::uint8_t>(i)));
  }
  const auto entries = journal.of(kState, 0, kStart + 100);
  ASSERT_EQ(entries.size(), sizes.size());
  for (std::size_t i = 0; i < sizes.size(); ++i) {
    EXPECT_EQ(entries[i].receivedMs, kStart + i);
    EXPECT_EQ(entries[i].row, &row(kState));
    EXPECT_EQ(bytesOf(entries[i]), filled(sizes[i], static_cast<std::uint8_t>(i))) << i;
  }
}

TEST(Journal, keepsMetricsApart) {
  Journal journal;
  journal.add(row(kState), kStart, Bytes{1});
  journal.add(row(kCell), kStart + 1, Bytes{2});
  journal.add(row(kState), kStart + 2, Bytes{3});
  EXPECT_EQ(journal.of(kState, 0, kStart + 9).size(), 2U);
  EXPECT_EQ(bytesOf(*journal.last(kCell, kStart + 9)), Bytes{2});
  EXPECT_TRUE(journal.of(MetricValidator::K_SIM_FILE_INFO, 0, kStart + 9).empty());
  EXPECT_FALSE(journal.last(12345, kStart));
}

TEST(Journal, answersAsOfAMoment) {
  Journal journal;
  for (std::uint8_t i = 0; i < 10; ++i) journal.add(row(kState), kStart + 1000 * i, Bytes{i});
  EXPECT_FALSE(journal.last(kState, kStart - 1));
  EXPECT_EQ(bytesOf(*journal.last(kState, kStart + 3999)), Bytes{3});
  EXPECT_EQ(journal.lastMs(kStart + 3999), kStart + 3000);
  EXPECT_FALSE(journal.lastMs(kStart - 1));
  const auto newest = journal.newest(kState, kStart + 5000, 2);
  ASSERT_EQ(newest.size(), 2U);
  EXPECT_EQ(bytesOf(newest[0]), Bytes{5});
  EXPECT_EQ(bytesOf(newest[1]), Bytes{4});
}

TEST(Journal, saysWhenTheNewestCameWithoutTheirPayloads) {
  Journal journal({.ageMs = 60'000, .bytes = 1U << 20U});
  journal.add(row(kCell), kStart, Bytes{7});
  for (std::uint64_t i = 0; i < 500; ++i) {
    journal.add(row(kState), kStart + 1000 * i, filled(i % 700, 1));
    if (i % 3 == 0) journal.add(row(kCell), kStart + 1000 * i, Bytes{8});
  }
  for (const std::int64_t metric : {kState, kCell, std::int64_t{12345}}) {
    for (const std::uint64_t atMs : {kStart - 1, kStart, kStart + 470'500, kStart + 900'000}) {
      for (const std::size_t most :
           {std::size_t{0}, std::size_t{1}, std::size_t{9}, std::size_t{300}}) {
        const auto newest = journal.newest(metric, atMs, most);
        std::vector<std::uint64_t> times(most);
        ASSERT_EQ(journal.newestTimes(metric, atMs, times), newest.size());
        for (std::size_t i = 0; i < newest.size(); ++i) EXPECT_EQ(times[i], newest[i].receivedMs);
      }
    }
  }
}

TEST(Journal, keepsTheNewestOfEachMetricWhenTheOldestGo) {
  Journal journal({.ageMs = 10'000, .bytes = 1U << 20U});
  journal.add(row(kCell), kStart, Bytes{7, 7});
  for (std::uint64_t i = 0; i < 1000; ++i) {
    journal.add(row(kState), kStart + 1000 * i, Bytes{static_cast<std::uint8_t>(i)});
  }
  const std::uint64_t end = kStart + 999'000;
  ASSERT_TRUE(journal.last(kCell, end));
  EXPECT_EQ(bytesOf(*journal.last(kCell, end)), (Bytes{7, 7}));
  EXPECT_EQ(journal.last(kCell, end)->receivedMs, kStart);
  EXPECT_FALSE(journal.last(kCell, kStart - 1));
  EXPECT_LE(journal.of(kState, 0, end).size(), 10U + 2 * 66U) << "at most two chunks more";
  EXPECT_GE(journal.of(kState, 0, end).size(), 10U);
}

TEST(Journal, takesNoMoreMemoryThanItMay) {
  constexpr std::size_t kBytes = 256 * 1024;
  Journal journal({.ageMs = 0, .bytes = kBytes});
  for (std::uint64_t i = 0; i < 100'000; ++i) journal.add(row(kState), kStart + i, filled(60, 1));
  EXPECT_LE(journal.bytes(), kBytes);
  EXPECT_GT(journal.of(kState, 0, kStart + 100'000).size(), 3000U);
}

TEST(Journal, takesATimeThatGoesBackForTheLastOne) {
  Journal journal;
  journal.add(row(kState), kStart + 1000, Bytes{1});
  journal.add(row(kState), kStart, Bytes{2});
  const auto entries = journal.of(kState, kStart + 1000, kStart + 1000);
  ASSERT_EQ(entries.size(), 2U);
  EXPECT_EQ(bytesOf(entries[1]), Bytes{2});
}

TEST(Journal, goesOnAcrossTimesOfAnyDistance) {
  Journal journal({.ageMs = 0, .bytes = 1U << 20U});
  std::uint64_t timeMs = 0;
  for (std::uint64_t distance = 1; distance < std::uint64_t{1} << 50U; distance *= 2) {
    journal.add(row(kState), timeMs += distance, Bytes{9});
  }
  const auto entries = journal.of(kState, 0, ~std::uint64_t{0});
  ASSERT_EQ(entries.size(), 50U);
  EXPECT_EQ(entries.back().receivedMs, timeMs);
  EXPECT_EQ(entries.front().receivedMs, 1U);
}

}  // namespace
}  // namespace qel
