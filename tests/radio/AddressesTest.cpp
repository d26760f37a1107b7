#include "radio/Addresses.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

using Texts = std::vector<std::string>;

Bytes sixteen() {
  Bytes bytes = {0x20, 0x01, 0x0d, 0xb8};
  bytes.resize(16);
  bytes[15] = 0x17;
  return bytes;
}

Bytes followedByIPv4(Bytes bytes) {
  for (const std::uint8_t byte : Bytes{192, 0, 2, 118}) bytes.push_back(byte);
  return bytes;
}

TEST(Addresses, areWrittenAsPeopleDo) {
  EXPECT_EQ(addressTexts(Bytes{192, 0, 2, 118}), Texts{"192.0.2.118"});
  EXPECT_EQ(addressTexts(sixteen()), Texts{"2001:db8::17"});
}

TEST(Addresses, ofBothKindsStandOneAfterTheOther) {
  EXPECT_EQ(addressTexts(followedByIPv4(sixteen())), (Texts{"2001:db8::17", "192.0.2.118"}));
}

TEST(Addresses, mayHaveTheEndOfOneOfIPv6Alone) {
  const Bytes interface = {0, 0, 0, 0, 0, 0, 0, 0x17};
  EXPECT_EQ(addressTexts(interface), Texts{"::17"});
  EXPECT_EQ(addressTexts(followedByIPv4(interface)), (Texts{"::17", "192.0.2.118"}));
}

TEST(Addresses, areNoneOfAnyOtherLength) {
  for (const std::size_t size : {0U, 1U, 3U, 5U, 15U, 17U, 19U, 21U, 64U}) {
    EXPECT_EQ(addressTexts(Bytes(size, 1)), Texts{}) << size;
  }
}

}  // namespace
}  // namespace qel
