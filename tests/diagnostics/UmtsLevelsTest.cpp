// The serving cell's levels, the phone's own power and the neighbours, from UMTS's logs.

#include <gtest/gtest.h>

#include "support/diagnostics/UmtsPackets.h"

namespace qel::diagnostics {
namespace {

using test::umtsCell;
using test::umtsGainControl;
using test::UmtsModem;
using test::umtsRanks;
using test::WrittenUmtsRank;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kCell = 0x4127;
constexpr std::uint16_t kState = 0x4125;
constexpr std::uint16_t kRanks = 0x4005;
constexpr std::uint16_t kGainControl = 0x4176;
constexpr std::uint32_t kSignal = 53506;
constexpr std::uint32_t kPower = 53507;
constexpr std::uint32_t kNeighbours = 53509;

const std::vector<WrittenUmtsRank> kThreeCells = {
    {10638, 407, -78, -8}, {10638, 92, -82, -12}, {10663, 511, -118, -20.5}};

class UmtsRanksOfVersion : public ::testing::TestWithParam<unsigned> {};

TEST_P(UmtsRanksOfVersion, tellTheServingCellsSignal) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kRanks, umtsRanks(GetParam(), kThreeCells)),
            (Metrics{kSignal, kNeighbours}));
  EXPECT_EQ(modem.said(kSignal),
            R"({"rx_info": [{"rssi": -70, "rsrp_range": 38, "rsrq_range": 33}]})");
}

TEST_P(UmtsRanksOfVersion, tellTheNeighbours) {
  UmtsModem modem;
  modem.send(kRanks, umtsRanks(GetParam(), kThreeCells, {{62, 21, -85}, {1023, 64, -111}}));
  EXPECT_EQ(modem.said(kNeighbours),
            R"({"meas_utra_result": [)"
            R"({"uarfcn": 10638, "psc": 92, "ecno": 25, "rscp": 34}, )"
            R"({"uarfcn": 10663, "psc": 511, "ecno": 8, "rscp": -2}], )"
            R"("meas_gsm_result": [{"arfcn": 62, "bsic": 21, "rxlev": 25}, )"
            R"({"arfcn": 1023, "rxlev": 0}]})");
}

INSTANTIATE_TEST_SUITE_P(Known, UmtsRanksOfVersion, ::testing::Values(0, 1, 2));

TEST(UmtsRanks, ofALaterVersionTellNothing) {
  UmtsModem modem;
  Bytes body = umtsRanks(2, kThreeCells);
  body[0] |= 0xC0;
  EXPECT_TRUE(modem.send(kRanks, body).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(UmtsRanks, withOneImpossibleCellTellNothing) {
  UmtsModem modem;
  EXPECT_TRUE(
      modem.send(kRanks, umtsRanks(0, {{10638, 407, -78, -8}, {10638, 512, -80, -8}})).empty());
  EXPECT_EQ(modem.said(kNeighbours), "");
  EXPECT_EQ(modem.damaged(), 1U);
}

TEST(UmtsRanks, withoutAServingCellTellNothing) {
  UmtsModem modem;
  EXPECT_TRUE(modem.send(kRanks, umtsRanks(0, {}, {{62, 21, -85}})).empty());
  EXPECT_EQ(modem.damaged(), 0U);
}

TEST(UmtsRanks, replaceTheNeighboursThatWere) {
  UmtsModem modem;
  modem.send(kRanks, umtsRanks(0, kThreeCells));
  modem.send(kRanks, umtsRanks(0, {kThreeCells[0]}));
  EXPECT_EQ(modem.said(kNeighbours), "{}");
}

TEST(UmtsNeighbours, areForgottenAfterHalfAMinuteAndTheSignalAfterTenSeconds) {
  UmtsModem modem;
  modem.send(kRanks, umtsRanks(0, kThreeCells));
  modem.wait(10'001);
  modem.send(kState, Bytes{0});
  EXPECT_EQ(modem.said(kSignal), "");
  EXPECT_NE(modem.said(kNeighbours), "");
  modem.wait(20'000);
  modem.send(kState, Bytes{0});
  EXPECT_EQ(modem.said(kNeighbours), "");
}

TEST(UmtsNeighbours, areForgottenWithTheCellThatTheyWereNeighboursOf) {
  UmtsModem modem;
  modem.send(kCell, umtsCell());
  modem.send(kRanks, umtsRanks(0, kThreeCells));
  modem.send(kCell, umtsCell());  // the same again
  EXPECT_NE(modem.said(kNeighbours), "");
  modem.send(kCell, umtsCell({.cellId = 99, .scramblingCode = 92}));
  EXPECT_EQ(modem.said(kNeighbours), "");
  EXPECT_EQ(modem.said(kSignal), "");
}

TEST(UmtsNeighbours, areForgottenWhenTheClockIsSetBack) {
  UmtsModem modem;
  modem.send(kRanks, umtsRanks(0, kThreeCells));
  modem.setTime(1'780'000'000'000);
  modem.send(0xB0FF, {});
  EXPECT_EQ(modem.said(kNeighbours), "");
  EXPECT_EQ(modem.said(kSignal), "");
}

TEST(UmtsGainControl, tellsTheMeanOfEachReceiversFrames) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kGainControl,
                       umtsGainControl({{.first = -100, .second = -60}, {.first = -120}, {}})),
            Metrics{kSignal});
  EXPECT_EQ(modem.said(kSignal), R"({"rx_info": [{"rssi": -66}, {"rssi": -61}]})");
  EXPECT_EQ(modem.said(kPower), "");
}

TEST(UmtsGainControl, tellsTheMeanPowerOfTheFramesThatWereSent) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kGainControl, umtsGainControl({{.sent = 174}, {.sent = 274}, {}})),
            Metrics{kPower});
  EXPECT_EQ(modem.said(kPower), R"({"tx_power_info": [{"pusch_tx_power": 5}]})");
}

TEST(UmtsGainControl, ofFramesWithNothingInThemTellsNothing) {
  UmtsModem modem;
  EXPECT_TRUE(modem.send(kGainControl, umtsGainControl({{}, {}})).empty());
  EXPECT_TRUE(modem.send(kGainControl, umtsGainControl({})).empty());
  EXPECT_EQ(modem.understood(), 2U);
}

TEST(UmtsGainControl, ofAnotherEditionTellsNothing) {
  UmtsModem modem;
  Bytes body = umtsGainControl({{.first = -100}});
  body[0] = 3;
  EXPECT_TRUE(modem.send(kGainControl, body).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(UmtsGainControl, addsToWhatIsKnownOfTheSignal) {
  UmtsModem modem;
  modem.send(kRanks, umtsRanks(0, kThreeCells));
  modem.send(kGainControl, umtsGainControl({{.first = -100, .second = -60}}));
  EXPECT_EQ(modem.said(kSignal),
            R"({"rx_info": [{"rssi": -65, "rsrp_range": 38, "rsrq_range": 33}, {"rssi": -61}]})");
}

TEST(UmtsSignal, saysWhetherThePhoneIsConnected) {
  UmtsModem modem;
  modem.send(kState, Bytes{3});
  modem.send(kGainControl, umtsGainControl({{.first = -100}}));
  EXPECT_EQ(modem.said(kSignal), R"({"connected_mode": true, "rx_info": [{"rssi": -65}]})");
  modem.send(kState, Bytes{0});
  EXPECT_EQ(modem.said(kSignal), R"({"connected_mode": false, "rx_info": [{"rssi": -65}]})");
}

}  // namespace
}  // namespace qel::diagnostics
