#include "radio/CellIdentity.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

TEST(CellIdentities, ofLteAreABaseStationAndASector) {
  EXPECT_EQ(cellIdText(Technology::lte, 0x1234504), "74565·4");
  EXPECT_EQ(lteCellIdentity(0xFFFFFFF)->eNodeB, 0xFFFFFU);
  EXPECT_EQ(lteCellIdentity(0xFFFFFFF)->sector, 0xFFU);
  EXPECT_EQ(cellIdText(Technology::lte, 0), "0·0");
}

TEST(CellIdentities, ofUmtsAreAControllerAndACell) {
  EXPECT_EQ(cellIdText(Technology::umts, 0x0C90011), "201·17");
  EXPECT_EQ(umtsCellIdentity(0xFFFFFFF)->rnc, 0xFFFU);
  EXPECT_EQ(umtsCellIdentity(0xFFFFFFF)->cell, 0xFFFFU);
}

TEST(CellIdentities, ofGsmAreOneNumber) { EXPECT_EQ(cellIdText(Technology::gsm, 65535), "65535"); }

TEST(CellIdentities, withTooManyBitsStayWhole) {
  EXPECT_FALSE(lteCellIdentity(0x10000000));
  EXPECT_FALSE(umtsCellIdentity(0x10000000));
  EXPECT_EQ(cellIdText(Technology::lte, 0xFFFFFFFF), "4294967295");
  EXPECT_EQ(cellIdText(Technology::umts, 0x10000000), "268435456");
}

TEST(StationCodes, areTwoColours) {
  EXPECT_EQ(stationCode(63)->network, 7U);
  EXPECT_EQ(stationCode(42)->network, 5U);
  EXPECT_EQ(stationCode(42)->station, 2U);
  EXPECT_FALSE(stationCode(64));
}

}  // namespace
}  // namespace qel
