// The files of the simulated SIM card, and the codings that they share with other reports.
#include <gmock/gmock.h>

#include <map>
#include <string>

#include "messages/sim.h"
#include "sources/Metrics.h"
#include "sources/simulated/Bcd.h"
#include "sources/simulated/SimulatedDrive.h"
#include "sources/support/DriveLog.h"
#include "tesk/Constants.h"

namespace qel {
namespace {

using namespace sources;
using ::testing::ElementsAre;

TEST(Bcd, SwapsTheDigitsOfEachPairAndFillsAnOddEnd) {
  EXPECT_EQ(swappedDigits("1234"), (Bytes{0x21, 0x43}));
  EXPECT_EQ(swappedDigits("123"), (Bytes{0x21, 0xF3}));
  EXPECT_EQ(swappedDigits(""), Bytes{});
}

TEST(Bcd, AnImsiHasItsLengthTypeAndParityInFront) {
  EXPECT_EQ(encodedImsi("001010123456789"),
            (Bytes{0x08, 0x09, 0x10, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98}));
  EXPECT_EQ(encodedImsi("00101012345678"),
            (Bytes{0x08, 0x01, 0x10, 0x10, 0x10, 0x32, 0x54, 0x76, 0xF8}));
}

TEST(Bcd, ANetworkIsThreeBytesWithTwoOrThreeDigitsOfItsOwn) {
  EXPECT_EQ(encodedPlmn(1, 1, 2), (Bytes{0x00, 0xF1, 0x10}));
  EXPECT_EQ(encodedPlmn(310, 410, 3), (Bytes{0x13, 0x00, 0x14}));
  EXPECT_EQ(encodedPlmn(262, 7, 2), (Bytes{0x62, 0xF2, 0x70}));
}

class SimCard : public ::testing::Test {
 protected:
  void SetUp() override {
    const SourceAnswer answer = drive.query(metric::kSimFiles);
    ASSERT_TRUE(answer.known);
    EXPECT_EQ(testing::integerOf(answer.entries, tesk::kKeyMetricID), 0x3C0013);
    const auto message =
        KCellularSimCardFiles::initWithData(*answer.entries.find(tesk::kKeyPayload)->asBytes());
    ASSERT_TRUE(message);
    for (const auto& file : message->efLists()) files[file->efId()] = *file->content();
  }

  SimulatedDrive drive{1, testing::kDriveStartMs};
  std::map<std::uint32_t, Bytes> files;
};

TEST_F(SimCard, HasTheFilesThatEveryCardHas) {
  for (const std::uint32_t file : {0x2FE2U, 0x6F05U, 0x6F07U, 0x6F31U, 0x6F46U, 0x6F73U, 0x6F78U,
                                   0x6F7BU, 0x6F7EU, 0x6FADU, 0x6FE3U}) {
    EXPECT_TRUE(files.contains(file)) << std::hex << file;
  }
}

TEST_F(SimCard, IsASubscribersForTests) {
  EXPECT_EQ(files[0x6F07], (Bytes{0x08, 0x09, 0x10, 0x10, 0x10, 0x32, 0x54, 0x76, 0x98}));
}

TEST_F(SimCard, HasACardNumberWhoseCheckDigitIsRight) {
  ASSERT_EQ(files[0x2FE2].size(), 10U);
  std::string digits;
  for (const std::uint8_t byte : files[0x2FE2]) {
    digits += static_cast<char>('0' + (byte & 0xF));
    digits += static_cast<char>('0' + (byte >> 4));
  }
  EXPECT_EQ(digits.substr(0, 2), "89");  // telecommunication (ITU-T E.118)
  int sum = 0;
  for (std::size_t i = 0; i < digits.size(); ++i) {
    int digit = digits[digits.size() - 1 - i] - '0';
    if (i % 2 == 1) digit = digit * 2 > 9 ? digit * 2 - 9 : digit * 2;
    sum += digit;
  }
  EXPECT_EQ(sum % 10, 0) << digits;
}

TEST_F(SimCard, SaysHowManyDigitsTheNetworkCodeHas) {
  EXPECT_EQ(files[0x6FAD], (Bytes{0, 0, 0, 2}));
}

TEST_F(SimCard, NamesItsProviderInSeventeenBytes) {
  const Bytes& name = files[0x6F46];
  ASSERT_EQ(name.size(), 17U);
  EXPECT_EQ(std::string(name.begin() + 1, name.begin() + 13), "Test Network");
  EXPECT_EQ(name.back(), 0xFF);
}

TEST_F(SimCard, HasOneAccessClass) { EXPECT_EQ(files[0x6F78], (Bytes{0x02, 0x00})); }

TEST_F(SimCard, KnowsWhereThePhoneIsRegistered) {
  const Registration& registration = drive.phone().registration();
  const Bytes& location = files[0x6F7E];
  ASSERT_EQ(location.size(), 11U);
  EXPECT_EQ(location[0], registration.tmsi() >> 24);
  EXPECT_EQ(location[3], registration.tmsi() & 0xFF);
  EXPECT_THAT(Bytes(location.begin() + 4, location.begin() + 7), ElementsAre(0x00, 0xF1, 0x10));
  EXPECT_EQ(location[7] << 8 | location[8], static_cast<int>(registration.locationArea()));
  EXPECT_EQ(location[10], 0) << "updated";
  EXPECT_EQ(files[0x6F73].size(), 14U);
  const Bytes& eps = files[0x6FE3];
  ASSERT_EQ(eps.size(), 18U);
  EXPECT_EQ(eps[0], 11) << "length of the identity";
  EXPECT_EQ(eps[15] << 8 | eps[16], static_cast<int>(registration.trackingAreas().front()));
}

}  // namespace
}  // namespace qel
