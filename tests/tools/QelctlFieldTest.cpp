#include <nlohmann/json.hpp>

#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

std::string twoPowers(std::int32_t first, std::int32_t second) {
  KCellularLteTxPower report;
  for (const std::int32_t powerDbm : {first, second}) {
    auto power = std::make_shared<TxPowerInfo>();
    power->setPucchTxPower(powerDbm);
    report.addTxPowerInfo(power);
  }
  return metricLine(MetricValidator::K_LTE_TX_POWER, report);
}

class QelctlField : public ::testing::Test {
 protected:
  Outcome field(const std::vector<std::string>& words) const {
    std::vector<std::string> all = {"field", _recording.path()};
    all.insert(all.end(), words.begin(), words.end());
    return qelctl(all);
  }

  const TemporaryRecording _recording{twoPowers(-12, 7) + twoPowers(-11, 8)};
};

TEST_F(QelctlField, TellsAllOfAFieldToPeople) {
  const Outcome outcome = field({"LTE", "Tx Power", "pucch_tx_power", "--section", "1"});
  EXPECT_EQ(outcome.exitCode, 0);
  const auto lines = linesOf(outcome.out);
  ASSERT_GT(lines.size(), 8U);
  EXPECT_EQ(lines[0], "Power of the control channel (pucch_tx_power)");
  EXPECT_EQ(lines[1], "LTE, Tx Power, TxPowerInfo 1");
  EXPECT_EQ(lines[3], "Value            8 dBm");
  EXPECT_EQ(lines.back(), "Last 10 minutes  2 values from 7 to 8");
}

TEST_F(QelctlField, TellsTheSameToScripts) {
  const Outcome outcome = field({"LTE", "Tx Power", "pucch_tx_power", "--json"});
  ASSERT_EQ(outcome.exitCode, 0);
  const auto told = nlohmann::json::parse(outcome.out);
  EXPECT_EQ(told["key"], "pucch_tx_power");
  EXPECT_EQ(told["value"], "-11");
  EXPECT_EQ(told["unit"], "dBm");
  EXPECT_EQ(told["raw"], "-11");
  EXPECT_EQ(told["hexadecimal"], "0xfffffff5");
  EXPECT_EQ(told["clause"], "3GPP TS 36.213, clause 5.1.2");
  EXPECT_EQ(told["decoded"], nlohmann::json::array());
  ASSERT_EQ(told["curve"].size(), 1U);
  EXPECT_EQ(told["curve"][0][0], (nlohmann::json{{"time_ms", 1}, {"value", -12.0}}));
}

TEST_F(QelctlField, SaysWhatIsNotThere) {
  const Outcome noTable = field({"LTE", "TX Power", "pucch_tx_power"});
  EXPECT_EQ(noTable.exitCode, 64);
  EXPECT_EQ(noTable.err, "qelctl: no table is named \"LTE TX Power\"\n");
  const Outcome noField = field({"LTE", "Tx Power", "nothing"});
  EXPECT_EQ(noField.exitCode, 65);
  EXPECT_EQ(noField.err, "qelctl: " + _recording.path() +
                             ": section 0 of \"LTE Tx Power\" shows no value of \"nothing\"\n");
  EXPECT_EQ(field({"LTE", "Tx Power", "pucch_tx_power", "--section", "2"}).exitCode, 65);
  EXPECT_EQ(field({"LTE", "Tx Power", "pucch_tx_power", "--section", "-1"}).exitCode, 65);
  EXPECT_EQ(field({"LTE", "NAS", "reg_status"}).exitCode, 65) << "nothing was reported";
  EXPECT_EQ(field({"LTE", "Tx Power"}).exitCode, 64);
}

}  // namespace
}  // namespace qel::testing
