// What an LTE cell's system information says comes out as its rules of reselection.
#include <gtest/gtest.h>

#include "messages/lte_serving.h"
#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using nlohmann::json;

constexpr auto kRules = metric::kLteSelRes;

ToldMetrics broadcast(AirModem& modem, const Bytes& message, const AirCell& cell = {}) {
  return modem.air(AirChannel::bcchDlSch, message, cell);
}

TEST(LteRules, tellWhatACellAsksForInDb) {
  AirModem modem;
  EXPECT_EQ(broadcast(modem, sib1Message({.qRxLevMin = -65})), ToldMetrics{kRules});
  const json rules = modem.saying(kRules);
  EXPECT_EQ(rules["QRxLevMin"], -130) << "steps of 2 dB";
  EXPECT_FALSE(rules.contains("QQualMin"));
  EXPECT_FALSE(rules.contains("ims_emergency_support")) << "release 8 does not know of it";
}

TEST(LteRules, tellWhatRelease9Added) {
  AirModem modem;
  broadcast(modem, sib1Message({.ofRelease9 = true, .qQualMinDb = -18}));
  EXPECT_EQ(modem.saying(kRules)["QQualMin"], -18);
  EXPECT_EQ(modem.saying(kRules)["ims_emergency_support"], 1);
}

TEST(LteRules, tellFurtherBandsAsTheFirstListHasThem) {
  AirModem modem;
  broadcast(modem, sib1Message({.bands = {19, 26}}));
  EXPECT_EQ(modem.saying(kRules)["multi_band_info"], (json{19, 26}));
  broadcast(modem, sib1Message({.bands = {66, 10}}));
  EXPECT_EQ(modem.saying(kRules)["multi_band_info"], (json{64, 10}));
}

TEST(LteRules, tellWhoIsBarred) {
  AirModem modem;
  broadcast(modem, sib2Message(true, AirBarring{12, 5, 0b10001}));
  const json rules = modem.saying(kRules);
  EXPECT_EQ(rules["ac_barring_for_emergency"], 1);
  EXPECT_EQ(rules["mo_signalling_ac_barring_factor"], 12);
  EXPECT_EQ(rules["mo_signalling_ac_barring_time"], 5);
  EXPECT_EQ(rules["mo_signalling_ac_barring_for_special_ac"], 0b10001);
  EXPECT_FALSE(rules.contains("mo_data_ac_barring_factor"));
}

TEST(LteRules, tellTheThresholdsOfTheOwnFrequency) {
  AirModem modem;
  broadcast(modem, sib3Message({.qHyst = 4, .nonIntra = 6, .low = 2, .priority = 5, .intra = 31}));
  const json rules = modem.saying(kRules);
  EXPECT_EQ(rules["Q_hyst"], 4);
  EXPECT_EQ(rules["S_non_intra_search_P"], 12);
  EXPECT_EQ(rules["S_intra_search_P"], 62);
  EXPECT_EQ(rules["Thresh_serving_lowP"], 4);
  EXPECT_EQ(rules["priority_operating_freq"], 5);
}

TEST(LteRules, tellTheOtherFrequenciesByTheirChannels) {
  AirModem modem;
  broadcast(modem, sib5Message({{.earfcn = 40936, .bandwidth = 5, .priority = 6},
                                {.earfcn = 700, .qRxLevMin = -60, .high = 4, .low = 9}}));
  const json list = modem.saying(kRules)["nbr_eutra"];
  ASSERT_EQ(list.size(), 2U);
  EXPECT_EQ(list[0], (json{{"earfcn", 700},
                           {"Q_rxlev_min", -120},
                           {"Q_offset", 0},
                           {"dl_bw", 3},
                           {"Thres_X_highP", 8},
                           {"Thres_X_lowP", 18},
                           {"frame_type", "FDD"},
                           {"band", 2}}));
  EXPECT_EQ(list[1]["earfcn"], 40936);
  EXPECT_EQ(list[1]["priority"], 6);
  EXPECT_EQ(list[1]["frame_type"], "TDD");
  EXPECT_EQ(list[1]["band"], 41);
}

TEST(LteRules, gatherWhatTheBlocksOfOneCellSay) {
  AirModem modem;
  broadcast(modem, sib1Message({}));
  broadcast(modem, sib3Message({}));
  EXPECT_TRUE(modem.saying(kRules).contains("QRxLevMin"));
  EXPECT_TRUE(modem.saying(kRules).contains("Q_hyst"));
}

TEST(LteRules, areThoseOfTheCellThatSpokeLast) {
  AirModem modem;
  broadcast(modem, sib1Message({}));
  broadcast(modem, sib3Message({}), {.earfcn = 1300, .pci = 186});
  EXPECT_FALSE(modem.saying(kRules).contains("QRxLevMin"));
  EXPECT_TRUE(modem.saying(kRules).contains("Q_hyst"));
}

TEST(LteRules, addHowTheServingCellDividesItsTime) {
  AirModem modem;
  const auto cell = [&] {
    const auto payload = modem.reader().report(metric::kLteScellInfo, 1);
    return KCellularLteScellInfo::initWithData(payload.value_or(Bytes()));
  };
  modem.send(0xB0C2, lteServingCell(3));
  EXPECT_FALSE(cell()->hasTddSfAssignment());
  const AirCell own = {cell()->dlFreq(), cell()->phyCellId()};
  broadcast(modem, sib1Message({.tdd = AirTdd{2, 7}}), own);
  EXPECT_EQ(cell()->tddSfAssignment(), 2U);
  EXPECT_EQ(cell()->tddSsfPatterns(), 7U);
  broadcast(modem, sib1Message({.tdd = AirTdd{1, 5}}), {own.earfcn, own.pci + 1});
  EXPECT_FALSE(cell()->hasTddSfAssignment()) << "another cell's";
}

}  // namespace
}  // namespace qel::diagnostics
