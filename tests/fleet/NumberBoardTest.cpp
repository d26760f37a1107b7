#include "fleet/NumberBoard.h"

#include <gtest/gtest.h>
#include <prometheus/metric_family.h>

#include "fleet/OpenMetrics.h"

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr std::uint64_t kNowMs = 1'000'000;

class Board : public ::testing::Test {
 protected:
  std::string textAt(std::uint64_t nowMs) const {
    return "\n" + numberText(board.families(nowMs), NumberText::openMetrics);
  }
  bool has(const std::string& line, std::uint64_t nowMs = kNowMs) const {
    return textAt(nowMs).find("\n" + line + "\n") != std::string::npos;
  }
  std::size_t seriesOf(const std::string& name) const {
    for (const auto& family : board.families(kNowMs)) {
      if (family.name == name) return family.metric.size();
    }
    return 0;
  }

  NumberBoard board{60s};
};

TEST_F(Board, tellsWhatItWasToldLast) {
  board.set("a_db", "A", {{{{"cell", "1"}}, 5}, {{{"cell", "2"}}, 6}}, kNowMs);
  EXPECT_TRUE(has("a_db{cell=\"1\"} 5"));
  board.set("a_db", "A", {{{{"cell", "2"}}, 7}}, kNowMs);
  EXPECT_FALSE(has("a_db{cell=\"1\"} 5")) << "a cell that is gone";
  EXPECT_TRUE(has("a_db{cell=\"2\"} 7"));
  board.drop("a_db");
  EXPECT_EQ(seriesOf("a_db"), 0U);
}

TEST_F(Board, tellsNothingStale) {
  board.set("a_db", "A", {{{}, 5}}, kNowMs);
  EXPECT_TRUE(has("a_db 5", kNowMs + 60'000));
  EXPECT_FALSE(has("a_db 5", kNowMs + 60'001));
}

TEST_F(Board, countsWhatComes) {
  board.countReport("one", kNowMs - 1500);
  board.countReport("one", kNowMs - 500);
  board.countUndecodable();
  board.countDropped();
  board.countHappening("handover");
  board.countHappening("unheard-of");
  EXPECT_TRUE(has("qelwatch_reports_total{metric=\"one\"} 2"));
  EXPECT_TRUE(has("qelwatch_report_age_seconds{metric=\"one\"} 0.5"));
  EXPECT_TRUE(has("qelwatch_undecodable_reports_total 1"));
  EXPECT_TRUE(has("qelwatch_exporter_dropped_total 1"));
  EXPECT_TRUE(has("qelwatch_happenings_total{kind=\"handover\"} 1"));
  EXPECT_TRUE(has("qelwatch_happenings_total{kind=\"reject\"} 0")) << "there from the start";
  EXPECT_EQ(textAt(kNowMs).find("unheard-of"), std::string::npos);
}

TEST_F(Board, holdsOnlySoManySeriesOfAFamily) {
  NumberBoard::Numbers many;
  for (int i = 0; i < 1000; ++i) many[{{"cell", std::to_string(i)}}] = i;
  board.set("a_db", "A", many, kNowMs);
  EXPECT_EQ(seriesOf("a_db"), NumberBoard::kMostSeries);
  EXPECT_TRUE(
      has("qelwatch_exporter_left_out_total " + std::to_string(1000 - NumberBoard::kMostSeries)));
}

TEST_F(Board, countsOnlySoManyMetricsByName) {
  for (int i = 0; i < 1000; ++i) board.countReport("metric" + std::to_string(i), kNowMs);
  EXPECT_EQ(seriesOf("qelwatch_reports_total"), NumberBoard::kMostMetrics + 1);
  EXPECT_TRUE(has("qelwatch_reports_total{metric=\"other\"} " +
                  std::to_string(1000 - NumberBoard::kMostMetrics)));
}

}  // namespace
}  // namespace qel::fleet
