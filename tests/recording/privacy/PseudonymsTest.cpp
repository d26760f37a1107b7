#include "recording/privacy/Pseudonyms.h"

#include <gtest/gtest.h>

#include <set>

namespace qel {
namespace {

constexpr SipKey kKey = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16};
const Pseudonyms kPseudonyms(kKey);

Bytes bytes(const char* hex) { return bytesFromHex(hex).value(); }

// All its digits, as hexadecimal digits in the order of an IMSI.
std::string digitsOf(const Bytes& value) {
  std::string digits;
  for (const std::uint8_t byte : value) {
    for (const int half : {byte & 0xF, byte >> 4}) digits += "0123456789ABCDEF"[half];
  }
  return digits;
}

void expectDecimal(const std::string& digits) {
  EXPECT_EQ(digits.find_first_not_of("0123456789"), std::string::npos) << digits;
}

TEST(Pseudonyms, keepCountryAndNetworkOfAnImsi) {
  // Behind a length and a type: 001 01 0123456789.
  const std::string hidden = digitsOf(kPseudonyms.imsi(bytes("080910101032547698")));
  EXPECT_EQ(hidden.substr(0, 8), "80900101");
  EXPECT_NE(hidden.substr(8), "0123456789");
  expectDecimal(hidden);
  // Behind a type: 262 42 0123456789.
  const std::string typed = digitsOf(kPseudonyms.imsi(bytes("2926241032547698")));
  EXPECT_EQ(typed.substr(0, 6), "926242");
  EXPECT_NE(typed.substr(6), "0123456789");
  expectDecimal(typed);
  // Digits alone, an odd number of them: 262 42 0123456789.
  const std::string alone = digitsOf(kPseudonyms.imsi(bytes("62420221436587F9")));
  EXPECT_EQ(alone.substr(0, 5), "26242");
  EXPECT_NE(alone.substr(5, 10), "0123456789");
  EXPECT_EQ(alone.back(), 'F');
  expectDecimal(alone.substr(0, 15));
}

TEST(Pseudonyms, knowNetworksWithThreeDigits) {
  // 310 410 123456789.
  const std::string hidden = digitsOf(kPseudonyms.imsi(bytes("083901141032547698")));
  EXPECT_EQ(hidden.substr(0, 9), "809310410");
  EXPECT_NE(hidden.substr(9), "123456789");
  // 901 28 0123456789, digits alone: the 9 is no type.
  EXPECT_EQ(digitsOf(kPseudonyms.imsi(bytes("09210821436587F9"))).substr(0, 5), "90128");
}

TEST(Pseudonyms, giveTheSameImsiTheSameDigitsInAnyLayout) {
  const std::string behindLength = digitsOf(kPseudonyms.imsi(bytes("082926241032547698")));
  const std::string behindType = digitsOf(kPseudonyms.imsi(bytes("2926241032547698")));
  EXPECT_EQ(behindLength.substr(2), behindType);
}

TEST(Pseudonyms, replaceAllDigitsOfAnUnknownCountry) {
  const Bytes value = bytes("0819894410325476F8");
  const std::string hidden = digitsOf(kPseudonyms.imsi(value));
  EXPECT_EQ(hidden.substr(0, 3), digitsOf(value).substr(0, 3));
  EXPECT_NE(hidden.substr(3, 5), digitsOf(value).substr(3, 5));
}

TEST(Pseudonyms, replaceWholeWhatIsNoImsi) {
  for (const char* hex : {"00", "ABCDEFABCDEF", "0809", "FFFFFFFFFFFFFFFFFF",
                          "303132333435363738393031323334", "62420221A36587F9"}) {
    const Bytes hidden = kPseudonyms.imsi(bytes(hex));
    EXPECT_EQ(hidden.size(), bytes(hex).size());
    EXPECT_NE(hidden, bytes(hex));
  }
  EXPECT_TRUE(kPseudonyms.imsi({}).empty());
}

TEST(Pseudonyms, keepTheKindOfATemporaryIdentity) {
  std::set<std::uint32_t> seen;
  for (const std::uint32_t kind : {0U, 1U, 2U, 3U}) {
    for (std::uint32_t i = 0; i < 1000; ++i) {
      const std::uint32_t value = kind << 30U | i;
      const std::uint32_t hidden = kPseudonyms.temporaryIdentity(value);
      EXPECT_EQ(hidden >> 30U, kind);
      EXPECT_NE(hidden, value);
      EXPECT_NE(hidden, 0xFFFFFFFF);
      seen.insert(hidden);
    }
  }
  EXPECT_GT(seen.size(), 3990U);
  EXPECT_EQ(kPseudonyms.temporaryIdentity(0xFFFFFFFF), 0xFFFFFFFF);
}

TEST(Pseudonyms, replaceEveryByteStringByOneOfItsLength) {
  for (std::size_t length = 1; length <= 300; ++length) {
    const Bytes value(length, 0xFF);
    const Bytes hidden = kPseudonyms.opaque(value);
    EXPECT_EQ(hidden.size(), length);
    EXPECT_NE(hidden, value);
  }
  EXPECT_TRUE(kPseudonyms.opaque({}).empty());
  for (unsigned byte = 0; byte < 256; ++byte) {
    const Bytes value = {static_cast<std::uint8_t>(byte)};
    EXPECT_NE(kPseudonyms.opaque(value), value);
  }
}

TEST(Pseudonyms, keepAddressesPrivate) {
  const Bytes v4 = kPseudonyms.address(bytes("C0000235"));
  ASSERT_EQ(v4.size(), 4U);
  EXPECT_EQ(v4[0], 10);
  const Bytes v6 = kPseudonyms.address(bytes("20010DB8000200000000000000000017"));
  ASSERT_EQ(v6.size(), 16U);
  EXPECT_EQ(v6[0], 0xFD);
  EXPECT_EQ(kPseudonyms.address(bytes("00000000")), bytes("00000000"));
}

TEST(Pseudonyms, giveAnAddressBesideAnotherTheSamePseudonymAsAlone) {
  const Bytes v4 = bytes("C0000235");
  const Bytes v6 = bytes("20010DB8000200000000000000000017");
  Bytes both = v4;
  both.insert(both.end(), v6.begin(), v6.end());
  Bytes expected = kPseudonyms.address(v4);
  const Bytes second = kPseudonyms.address(v6);
  expected.insert(expected.end(), second.begin(), second.end());
  EXPECT_EQ(kPseudonyms.address(both), expected);
  const Bytes withInterface = kPseudonyms.address(bytes("0000000000000017C0000235"));
  EXPECT_EQ(Bytes(withInterface.begin() + 8, withInterface.end()), kPseudonyms.address(v4));
  EXPECT_NE(Bytes(withInterface.begin(), withInterface.begin() + 8), bytes("0000000000000017"));
}

TEST(Pseudonyms, areStableForAKeyAndDifferForEachOther) {
  const Bytes value = bytes("080910101032547698");
  EXPECT_EQ(Pseudonyms(kKey).imsi(value), kPseudonyms.imsi(value));
  EXPECT_EQ(Pseudonyms(kKey).opaque(value), kPseudonyms.opaque(value));
  std::set<std::string> seen;
  for (int i = 0; i < 20; ++i) seen.insert(hexText(Pseudonyms::random().opaque(value)));
  EXPECT_EQ(seen.size(), 20U);
}

}  // namespace
}  // namespace qel
