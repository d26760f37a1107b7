// What the network configures for a connection of LTE: reception and secondary carriers.
#include <gtest/gtest.h>

#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using nlohmann::json;

constexpr auto kReception = metric::kLteCdrxConfig;
constexpr auto kCarriers = metric::kLteCarrierAggregation;
constexpr auto kComponents = metric::kLteComponentCarriers;

TEST(LteReception, tellsWhenThePhoneMaySleep) {
  AirModem modem;
  const auto told = modem.air(AirChannel::dlCcch, setupWithDrx(AirDrx{}));
  EXPECT_EQ(told, (ToldMetrics{metric::kLteRrcState, kReception}));
  EXPECT_EQ(modem.saying(kReception), (json{{"on_duration_ms", 10},
                                            {"drx_inactivity_ms", 100},
                                            {"drx_retx_timer_ms", 8},
                                            {"long_drx_cycle_ms", 320},
                                            {"short_drx_cycle_ms", 80},
                                            {"drx_short_cycle_num", 2},
                                            {"rrc_state", "KLTE_RRC_STATE_ATMPT_CONNECTION"}}));
}

TEST(LteReception, hasNoShortCycleWhereNoneIsSet) {
  AirModem modem;
  modem.air(AirChannel::dlCcch, setupWithDrx(AirDrx{.shortCycle = false}));
  EXPECT_FALSE(modem.saying(kReception).contains("short_drx_cycle_ms"));
}

TEST(LteReception, isContinuousAgainWhenTheNetworkSaysSo) {
  AirModem modem;
  modem.air(AirChannel::dlCcch, setupWithDrx(AirDrx{}));
  const auto told = modem.air(AirChannel::dlCcch, setupWithDrx(std::nullopt));
  EXPECT_EQ(told, ToldMetrics{kReception});
  EXPECT_EQ(modem.saying(kReception), (json{{"rrc_state", "KLTE_RRC_STATE_ATMPT_CONNECTION"}}));
}

TEST(LteReception, tellsTheTransmissionModeWhenItChanges) {
  AirModem modem;
  EXPECT_EQ(modem.air(AirChannel::dlCcch, setupWithAntennas(3)), ToldMetrics{metric::kLteRrcState})
      << "a connection begins with one";
  EXPECT_EQ(modem.air(AirChannel::dlDcch, reconfigurationWithAntennas(4)),
            (ToldMetrics{metric::kLteRrcState, kReception}));
  EXPECT_EQ(modem.saying(kReception)["transmission_mode"], 4);
}

TEST(LteReception, isForgottenWithTheConnection) {
  AirModem modem;
  modem.air(AirChannel::dlCcch, setupWithDrx(AirDrx{}));
  modem.air(AirChannel::dlDcch, connectionRelease(1));
  EXPECT_TRUE(modem.saying(kReception).is_null());
}

TEST(LteCarriers, areThoseThatTheNetworkAdds) {
  AirModem modem;
  modem.air(AirChannel::dlDcch, ciphering());
  const auto told =
      modem.air(AirChannel::dlDcch, secondaryCells({}, {{2, 77, 40936}, {1, 301, 700}}));
  EXPECT_EQ(told, (ToldMetrics{kCarriers, kComponents}));
  const json list = modem.saying(kCarriers)["scc_list"];
  ASSERT_EQ(list.size(), 2U);
  EXPECT_EQ(list[0]["index"], 1);
  EXPECT_EQ(list[0]["pci"], 301);
  EXPECT_EQ(list[0]["dl_earfcn"], 700);
  EXPECT_EQ(list[0]["dl_rf_band"], 2);
  EXPECT_EQ(list[0]["has_uplink"], false);
  EXPECT_EQ(list[1]["index"], 2);
  EXPECT_EQ(list[1]["dl_rf_band"], 41);
  EXPECT_EQ(modem.saying(kComponents),
            (json{{"pcc_earfcn", 1300}, {"scc0_earfcn", 700}, {"scc1_earfcn", 40936}}));
}

TEST(LteCarriers, goWhenTheNetworkTakesThemAway) {
  AirModem modem;
  modem.air(AirChannel::dlDcch, secondaryCells({}, {{2, 77, 40936}, {1, 301, 700}}));
  modem.air(AirChannel::dlDcch, secondaryCells({1}, {}));
  const json list = modem.saying(kCarriers)["scc_list"];
  ASSERT_EQ(list.size(), 1U);
  EXPECT_EQ(list[0]["index"], 2);
}

TEST(LteCarriers, areReplacedByOnesOfTheSameIndex) {
  AirModem modem;
  modem.air(AirChannel::dlDcch, secondaryCells({}, {{1, 301, 700}}));
  modem.air(AirChannel::dlDcch, secondaryCells({1}, {{1, 12, 2300}}));
  const json list = modem.saying(kCarriers)["scc_list"];
  ASSERT_EQ(list.size(), 1U);
  EXPECT_EQ(list[0]["dl_earfcn"], 2300);
}

TEST(LteCarriers, goWithTheConnection) {
  for (const Bytes& end : {connectionRelease(1), Bytes()}) {
    AirModem modem;
    modem.air(AirChannel::dlDcch, secondaryCells({}, {{1, 301, 700}}));
    modem.wait(1);
    const auto told = end.empty() ? modem.air(AirChannel::ulCcch, reestablishmentRequest(301, 2))
                                  : modem.air(AirChannel::dlDcch, end);
    EXPECT_NE(std::find(told.begin(), told.end(), kCarriers), told.end());
    EXPECT_FALSE(modem.saying(kCarriers).contains("scc_list"));
  }
}

TEST(LteCarriers, outliveAnEventAboutTheConnectionBefore) {
  AirModem modem;
  modem.setTime(1'790'000'001'000);
  modem.air(AirChannel::dlDcch, secondaryCells({}, {{1, 301, 700}}));
  modem.setTime(1'790'000'000'000);
  modem.state(2);
  EXPECT_EQ(modem.saying(kCarriers)["scc_list"].size(), 1U);
  modem.setTime(1'790'000'002'000);
  modem.state(4);
  EXPECT_EQ(modem.state(2).size(), 3U);
  EXPECT_FALSE(modem.saying(kCarriers).contains("scc_list"));
}

TEST(LteCarriers, areNotToldInANewCellThatHasSaidNothingOfThem) {
  AirModem modem;
  modem.air(AirChannel::dlDcch, secondaryCells({}, {{1, 301, 700}}));
  modem.wait(1);
  modem.air(AirChannel::dlDcch, connectionRelease(1));
  EXPECT_FALSE(modem.saying(kCarriers).is_null());
  EXPECT_FALSE(modem.saying(kComponents).is_null());
  modem.air(AirChannel::dlCcch, plainSetup(), {.earfcn = 1300, .pci = 7});
  EXPECT_TRUE(modem.saying(kCarriers).is_null());
  EXPECT_TRUE(modem.saying(kComponents).is_null());
}

TEST(LteCarriers, goWhenTheNetworkConfiguresEverythingAnew) {
  AirModem modem;
  EXPECT_EQ(modem.air(AirChannel::dlDcch, fullConfiguration()), ToldMetrics{metric::kLteRrcState});
  modem.air(AirChannel::dlDcch, secondaryCells({}, {{1, 301, 700}}));
  EXPECT_EQ(modem.air(AirChannel::dlDcch, fullConfiguration()),
            (ToldMetrics{kCarriers, kComponents}));
  EXPECT_FALSE(modem.saying(kCarriers).contains("scc_list"));
}

}  // namespace
}  // namespace qel::diagnostics
