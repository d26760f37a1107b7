#include "radio/Digits.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

TEST(PackedDigits, standTwoAByteTheLowHalfFirst) {
  EXPECT_EQ(packedDigits(Bytes{0x98, 0x10, 0xF3}), "89013");
  EXPECT_EQ(packedDigits(Bytes{0x21}), "12");
}

TEST(PackedDigits, areNoneWhereBytesHoldAnythingElse) {
  EXPECT_FALSE(packedDigits(Bytes{}));
  EXPECT_FALSE(packedDigits(Bytes{0xFF}));
  EXPECT_FALSE(packedDigits(Bytes{0x2A}));
  EXPECT_FALSE(packedDigits(Bytes{0xF1, 0x11})) << "a gap within";
}

TEST(MobileIdentity, isFoundBehindItsLengthOrWithoutOne) {
  EXPECT_EQ(mobileIdentity(Bytes{8, 0x09, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98, 0x00}),
            "001012345678900");
  EXPECT_EQ(mobileIdentity(Bytes{0x09, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98, 0x00}),
            "001012345678900");
}

TEST(MobileIdentity, mayBeShorterThanItsElement) {
  EXPECT_EQ(mobileIdentity(Bytes{8, 0x01, 0x10, 0x10, 0x32, 0x54, 0xF6, 0xFF, 0xFF}), "0010123456");
}

TEST(MobileIdentity, isNoneInOtherBytes) {
  EXPECT_FALSE(mobileIdentity(Bytes{}));
  EXPECT_FALSE(mobileIdentity(Bytes{8}));
  EXPECT_FALSE(mobileIdentity(Bytes{0x0C, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98, 0x00})) << "a TMSI";
  EXPECT_FALSE(mobileIdentity(Bytes{0x09, 0x10, 0xA0, 0x32, 0x54, 0x76, 0x98, 0x00}));
  EXPECT_FALSE(mobileIdentity(Bytes{0xF1, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF}));
}

}  // namespace
}  // namespace qel
