#include "fleet/NumberNames.h"

#include <gmock/gmock.h>

#include <set>

#include "fleet/FieldNumbers.h"

namespace qel::fleet {
namespace {

TEST(NumberNames, areWordsOfTheSchemas) {
  EXPECT_EQ(asWords("LteTxPower"), "lte_tx_power");
  EXPECT_EQ(asWords("QQualMin"), "qqual_min");
  EXPECT_EQ(asWords("lowQ"), "low_q");
  EXPECT_EQ(asWords("RSRP"), "rsrp");
  EXPECT_EQ(asWords(""), "");
}

TEST(NumberNames, leaveNoLetterAloneBeforeAWord) {
  EXPECT_EQ(asWords("S_intra_search_Q"), "sintra_search_q");
  EXPECT_EQ(asWords("s_rxlev"), "srxlev");
}

TEST(NumberNames, endWithTheBaseUnit) {
  const auto duration = numberName("lte_rrc_state_prev_state_dur_ms", "ms");
  ASSERT_TRUE(duration);
  EXPECT_EQ(duration->text, "qelwatch_lte_rrc_state_prev_state_dur_seconds");
  EXPECT_DOUBLE_EQ(duration->inBaseUnit(320), 0.32);
  EXPECT_EQ(numberName("last_x_seconds", "s")->text, "qelwatch_last_x_seconds");
  EXPECT_EQ(numberName("idle_rxlev_dBm", "dBm")->text, "qelwatch_idle_rxlev_dbm");
  EXPECT_DOUBLE_EQ(numberName("dl_bw", "MHz")->inBaseUnit(widened(1.4F)), 1'400'000);
  EXPECT_DOUBLE_EQ(numberName("t3212", "tenths of an hour")->inBaseUnit(10), 3600);
  EXPECT_FALSE(numberName("mass", "kg"));
}

TEST(NumberNames, tellTheirUnit) {
  EXPECT_EQ(baseUnitOf("qelwatch_lte_rsrp_dbm"), "dbm");
  EXPECT_EQ(baseUnitOf("qelwatch_report_age_seconds"), "seconds");
  EXPECT_EQ(baseUnitOf("qelwatch_service_up"), "");
  EXPECT_EQ(baseUnitOf("seconds"), "");
}

TEST(FieldNumbers, haveNamesThatPrometheusTakesAndOnce) {
  const auto names = FieldNumbers().names();
  EXPECT_GT(names.size(), 30U);
  EXPECT_EQ(std::set<std::string>(names.begin(), names.end()).size(), names.size());
  for (const std::string& name : names) {
    EXPECT_THAT(name, ::testing::MatchesRegex("qelwatch_[a-z][a-z0-9_]*"));
    EXPECT_NE(baseUnitOf(name), "") << name;
    EXPECT_EQ(name.find("__"), std::string::npos) << name;
    EXPECT_EQ(name.find("tmsi"), std::string::npos) << name;
  }
}

}  // namespace
}  // namespace qel::fleet
