#include "radio/Networks.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

TEST(Networks, haveTheDigitsThatTheReportSays) {
  EXPECT_EQ(networkOf(262, 1, 2)->text(), "262-01");
  EXPECT_EQ(networkOf(1, 1, 2)->text(), "001-01");
  EXPECT_EQ(networkOf(310, 26, 3)->text(), "310-026");
  EXPECT_EQ(networkOf(310, 26, 2)->text(), "310-26");
}

TEST(Networks, haveTheDigitsOfTheirCountryWhereTheReportSaysNone) {
  EXPECT_EQ(networkOf(460, 0)->text(), "460-00");
  EXPECT_EQ(networkOf(310, 26)->text(), "310-026");
  EXPECT_EQ(networkOf(302, 72, 0)->text(), "302-072") << "0 digits are no number of digits";
  EXPECT_EQ(networkOf(405, 854)->text(), "405-854");
}

TEST(Networks, neverLoseADigit) {
  EXPECT_EQ(networkOf(405, 854, 2)->text(), "405-854");
  EXPECT_FALSE(networkOf(1000, 1));
  EXPECT_FALSE(networkOf(262, 1000));
}

TEST(Networks, goThroughTheirThreeBytes) {
  const Bytes two = {0x62, 0xF2, 0x10};
  EXPECT_EQ(networkOfBytes(two), (Network{"262", "01"}));
  EXPECT_EQ(bytesOf({"262", "01"}), two);
  const Bytes three = {0x13, 0x60, 0x20};
  EXPECT_EQ(networkOfBytes(three), (Network{"310", "026"}));
  EXPECT_EQ(bytesOf({"310", "026"}), three);
}

TEST(Networks, areNoneWhereTheBytesAreNoDigits) {
  for (const Bytes& bytes :
       {Bytes{}, Bytes{0x62, 0xF2}, Bytes{0xFF, 0xFF, 0xFF}, Bytes{0x62, 0xF2, 0x1A},
        Bytes{0x62, 0xE2, 0x10}, Bytes{0x62, 0xF2, 0x10, 0x00}}) {
    EXPECT_FALSE(networkOfBytes(bytes)) << hexText(bytes);
  }
  EXPECT_FALSE(bytesOf({"26", "01"}));
  EXPECT_FALSE(bytesOf({"262", "0a"}));
  EXPECT_FALSE(bytesOf({"262", "0001"}));
}

}  // namespace
}  // namespace qel
