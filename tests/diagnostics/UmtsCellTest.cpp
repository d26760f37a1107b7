// The serving cell and the state of the connection, from UMTS's logs.

#include <gtest/gtest.h>

#include "sources/diagnostics/umts/UmtsReaders.h"
#include "support/diagnostics/UmtsPackets.h"

namespace qel::diagnostics {
namespace {

using test::umtsCell;
using test::UmtsModem;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kCell = 0x4127;
constexpr std::uint16_t kState = 0x4125;
constexpr std::uint32_t kCellInfo = 12300;
constexpr std::uint32_t kRrcState = 53522;

TEST(UmtsCell, isToldWithItsNetworkAreaAndCarrier) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kCell, umtsCell()), Metrics{kCellInfo});
  EXPECT_EQ(modem.said(kCellInfo),
            R"({"mcc": 262, "mnc": 7, "lac": 55596, "cell_id": 56625155, )"
            R"("wcdma_band": "SYS_BAND_WCDMA_I_IMT_2000", "dl_uarfcn": 10638, "psc": 407, )"
            R"("num_mnc_digits": 2})");
  EXPECT_EQ(modem.reader().picture().technology, Technology::umts);
}

TEST(UmtsCell, countsTheDigitsOfItsNetwork) {
  UmtsModem modem;
  modem.send(kCell, umtsCell({.mcc = "310", .mnc = "026"}));
  EXPECT_NE(modem.said(kCellInfo).find(R"("mnc": 26,)"), std::string::npos);
  EXPECT_NE(modem.said(kCellInfo).find(R"("num_mnc_digits": 3)"), std::string::npos);
}

TEST(UmtsCell, hasNoNetworkWhereADigitIsNone) {
  UmtsModem modem;
  modem.send(kCell, umtsCell({.mcc = "2:2"}));
  EXPECT_EQ(modem.said(kCellInfo).find("mcc"), std::string::npos);
  EXPECT_NE(modem.said(kCellInfo).find("psc"), std::string::npos);
}

TEST(UmtsCell, isLeftAsItWasByOneThatCannotBe) {
  UmtsModem modem;
  modem.send(kCell, umtsCell());
  const std::string before = modem.said(kCellInfo);
  EXPECT_TRUE(modem.send(kCell, umtsCell({.scramblingCode = 512})).empty());
  EXPECT_TRUE(modem.send(kCell, umtsCell({.uarfcn = 16384})).empty());
  EXPECT_TRUE(modem.send(kCell, umtsCell({.cellId = 0x10000000})).empty());
  EXPECT_TRUE(modem.send(kCell, umtsCell({.areaCode = 0x10000})).empty());
  EXPECT_EQ(modem.said(kCellInfo), before);
  EXPECT_EQ(modem.damaged(), 4U);
}

TEST(UmtsState, isToldByItsNumber) {
  const char* const kStates[] = {"IDLE",     "ESTABLISH", "CELL_FACH",
                                 "CELL_DCH", "CELL_PCH",  "URA_PCH"};
  for (std::uint8_t code = 0; code < 6; ++code) {
    UmtsModem modem;
    EXPECT_EQ(modem.send(kState, Bytes{code}), Metrics{kRrcState});
    EXPECT_EQ(modem.said(kRrcState),
              std::string(R"({"state": "KWCDMA_RRC_CONN_STATE_)") + kStates[code] + "\"}");
  }
}

TEST(UmtsState, isInactiveWhenTheServingCellIsAnotherTechnologys) {
  const Bytes body{0};
  Picture picture;
  picture.technology = Technology::lte;
  Told told;
  EXPECT_EQ(readUmtsState({.body = body}, picture, told), Outcome::understood);
  EXPECT_EQ(picture.umts.connection.state, UmtsState::inactive);
  EXPECT_EQ(picture.technology, Technology::lte);
}

TEST(UmtsState, beyondTheKnownOnesTellsNothing) {
  UmtsModem modem;
  EXPECT_TRUE(modem.send(kState, Bytes{6}).empty());
  EXPECT_TRUE(modem.send(kState, {}).empty());
  EXPECT_EQ(modem.said(kRrcState), "");
  EXPECT_EQ(modem.damaged(), 2U);
}

}  // namespace
}  // namespace qel::diagnostics
