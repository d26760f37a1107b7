// Packet connections of 2G and 3G, from the messages to the metric. The bytes are written as the
// tables of 24.008, clause 9.5, have them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "messages/nas.h"
#include "sources/Metrics.h"
#include "support/diagnostics/MobilePackets.h"
#include "support/diagnostics/ReportChecks.h"

namespace qel::diagnostics {
namespace {

using test::BodyWriter;
using test::fromPhone;
using test::Heart;
using test::toPhone;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr std::uint16_t kLog = 0x713A;

KCellularActivatedBearerContexts connectionsOf(const Heart& heart) {
  return heart.report<KCellularActivatedBearerContexts>(metric::kBearers);
}

Bytes activateRequest(std::uint32_t transaction, std::uint32_t nsapi, std::uint8_t type = 0x21) {
  return BodyWriter()
      .u8(transaction << 4 | 0xAU)
      .u8(0x41)
      .u8(nsapi)
      .u8(3)
      .bytes(Bytes{3, 0, 0, 0})
      .bytes(Bytes{2, 1, type})
      .bytes(Bytes{0x28, 9, 3, 'a', 'p', 'n', 4, 't', 'e', 's', 't'});
}

Bytes activateAccept(std::uint32_t transaction, const Bytes& address) {
  const Bytes options{0x27, 15, 0x80, 0x00, 0x0D, 4, 192, 0, 2, 53, 0x00, 0x0D, 4, 192, 0, 2, 54};
  return BodyWriter()
      .u8(0x80U | transaction << 4 | 0xAU)
      .u8(0x42)
      .u8(3)
      .bytes(Bytes{3, 0, 0, 0})
      .u8(4)
      .u8(0x2B)
      .u8(address.size())
      .bytes(address)
      .bytes(options);
}

const Bytes kAddress{1, 0x21, 192, 0, 2, 17};

TEST(NasConnections, AreThereOnceTheNetworkGrantsThem) {
  Heart heart;
  EXPECT_THAT(heart.take(kLog, fromPhone(activateRequest(0, 5))), IsEmpty());
  EXPECT_FALSE(heart.knows(metric::kBearers));
  EXPECT_THAT(heart.take(kLog, toPhone(activateAccept(0, kAddress))),
              ElementsAre(metric::kBearers));
  const auto connections = connectionsOf(heart);
  EXPECT_EQ(connections.bearerContextCount(), 1U);
  ASSERT_THAT(connections.bearerContexts(), SizeIs(1));
  const auto& one = *connections.bearerContexts()[0];
  EXPECT_EQ(one.nsapi(), 5U);
  EXPECT_EQ(one.apn(), "apn.test");
  EXPECT_EQ(one.pdpType(), 0);
  EXPECT_EQ(one.pdpAddr(), (Bytes{192, 0, 2, 17}));
  EXPECT_EQ(one.primaryDnsAddr(), (Bytes{192, 0, 2, 53}));
  EXPECT_EQ(one.secondaryDnsAddr(), (Bytes{192, 0, 2, 54}));
  EXPECT_FALSE(one.hasCid());
}

TEST(NasConnections, HaveAddressesOfEveryKind) {
  Bytes v6{1, 0x57};
  Bytes both{1, 0x8D, 192, 0, 2, 17};
  Bytes interface;
  for (std::uint8_t i = 0; i < 16; ++i) {
    v6.push_back(i);
    both.push_back(i);
    if (i >= 8) interface.push_back(i);
  }
  Bytes expected = interface;
  expected.insert(expected.end(), {192, 0, 2, 17});
  Heart heart;
  heart.take(kLog, fromPhone(activateRequest(1, 6, 0x57)));
  heart.take(kLog, toPhone(activateAccept(1, v6)));
  heart.take(kLog, fromPhone(activateRequest(2, 7, 0x8D)));
  heart.take(kLog, toPhone(activateAccept(2, both)));
  const auto connections = connectionsOf(heart);
  ASSERT_THAT(connections.bearerContexts(), SizeIs(2));
  EXPECT_EQ(connections.bearerContexts()[0]->pdpType(), 1);
  EXPECT_EQ(connections.bearerContexts()[0]->pdpAddr(), Bytes(v6.begin() + 2, v6.end()));
  EXPECT_EQ(connections.bearerContexts()[1]->pdpType(), 2);
  EXPECT_EQ(connections.bearerContexts()[1]->pdpAddr(), expected);
}

TEST(NasConnections, EndWhenOneSideSaysSo) {
  Heart heart;
  for (std::uint32_t transaction = 0; transaction < 3; ++transaction) {
    heart.take(kLog, fromPhone(activateRequest(transaction, 5 + transaction)));
    heart.take(kLog, toPhone(activateAccept(transaction, kAddress)));
  }
  EXPECT_EQ(connectionsOf(heart).bearerContextCount(), 3U);
  EXPECT_THAT(heart.take(kLog, fromPhone(Bytes{0x0A, 0x46, 36})), ElementsAre(metric::kBearers));
  EXPECT_THAT(heart.take(kLog, toPhone(Bytes{0x9A, 0x46, 36})), ElementsAre(metric::kBearers));
  EXPECT_EQ(connectionsOf(heart).bearerContextCount(), 1U);
  EXPECT_THAT(heart.take(kLog, fromPhone(Bytes{0x08, 0x05, 0x01})), Contains(metric::kBearers));
  EXPECT_EQ(connectionsOf(heart).bearerContextCount(), 0U);
}

TEST(NasConnections, AreNotMadeOfARefusalOrAnUnknownGrant) {
  Heart heart;
  heart.take(kLog, fromPhone(activateRequest(0, 5)));
  heart.take(kLog, toPhone(Bytes{0x8A, 0x43, 33}));
  heart.take(kLog, toPhone(activateAccept(0, kAddress)));
  EXPECT_FALSE(heart.knows(metric::kBearers));
}

TEST(NasConnections, HaveLongTransactionNumbersAsWell) {
  Heart heart;
  const auto extended = [](Bytes message, std::uint8_t number) {
    message[0] = static_cast<std::uint8_t>(message[0] | 0x70);
    message.insert(message.begin() + 1, static_cast<std::uint8_t>(0x80 | number));
    return message;
  };
  heart.take(kLog, fromPhone(extended(activateRequest(0, 5), 9)));
  heart.take(kLog, toPhone(extended(activateAccept(0, kAddress), 9)));
  EXPECT_EQ(connectionsOf(heart).bearerContextCount(), 1U);
}

TEST(NasConnections, AreRememberedInSmallNumberWhileAskedFor) {
  Heart heart;
  for (std::uint8_t transaction = 7; transaction < 100; ++transaction) {
    Bytes request = activateRequest(7, 5);
    request.insert(request.begin() + 1, static_cast<std::uint8_t>(0x80 | transaction));
    heart.take(kLog, fromPhone(request));
  }
  EXPECT_THAT(heart.picture().nas.contexts.contexts, SizeIs(16));
}

TEST(NasConnections, StandEveryDamage) {
  test::mistreat(kLog, fromPhone(activateRequest(0, 5)), {metric::kBearers});
  test::mistreat(kLog, toPhone(activateAccept(0, kAddress)), {metric::kBearers});
}

}  // namespace
}  // namespace qel::diagnostics
