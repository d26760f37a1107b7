// Packet connections of LTE, from its session management's messages.
#include <gtest/gtest.h>

#include <memory>

#include "messages/nas.h"
#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using nlohmann::json;

constexpr auto kBearers = metric::kBearers;

std::vector<std::shared_ptr<BearerContext>> connections(const AirModem& modem) {
  const auto payload = modem.reader().report(kBearers, 1);
  if (!payload) return {};
  const auto message = KCellularActivatedBearerContexts::initWithData(*payload);
  EXPECT_EQ(message->bearerContextCount(), message->bearerContexts().size());
  return {message->bearerContexts().begin(), message->bearerContexts().end()};
}

TEST(EsmMessages, tellAConnectionThatBegins) {
  AirModem modem;
  EXPECT_TRUE(connections(modem).empty());
  EXPECT_EQ(modem.nas(kEsmIn, activateConnection({.bearer = 5,
                                                  .apn = "internet.example",
                                                  .nameServers = {{192, 0, 2, 1}, Bytes(16, 9)}})),
            ToldMetrics{kBearers});
  const auto list = connections(modem);
  ASSERT_EQ(list.size(), 1U);
  EXPECT_EQ(list[0]->nsapi(), 5U);
  EXPECT_EQ(list[0]->apn(), "internet.example");
  EXPECT_EQ(list[0]->pdpType(), 3) << "IPv4 as a connection of LTE";
  EXPECT_EQ(list[0]->pdpAddr(), (Bytes{10, 0, 0, 2}));
  EXPECT_EQ(list[0]->primaryDnsType(), 0);
  EXPECT_EQ(list[0]->primaryDnsAddr(), (Bytes{192, 0, 2, 1}));
  EXPECT_EQ(list[0]->secondaryDnsType(), 1);
  EXPECT_EQ(list[0]->secondaryDnsAddr(), Bytes(16, 9));
  EXPECT_FALSE(list[0]->hasCid()) << "the messages do not say it";
}

TEST(EsmMessages, tellTheKindsOfAddresses) {
  AirModem modem;
  modem.nas(kEsmIn, activateConnection({.bearer = 6, .type = 2, .address = Bytes(8, 7)}));
  modem.nas(kEsmIn, activateConnection({.bearer = 7, .type = 3, .address = Bytes(12, 8)}));
  modem.nas(kEsmIn, activateConnection({.bearer = 8, .type = 5, .address = {}}));
  const auto list = connections(modem);
  ASSERT_EQ(list.size(), 3U);
  EXPECT_EQ(list[0]->pdpType(), 4);
  EXPECT_EQ(list[0]->pdpAddr(), Bytes(8, 7));
  EXPECT_EQ(list[1]->pdpType(), 5);
  EXPECT_EQ(list[1]->pdpAddr(), Bytes(12, 8));
  EXPECT_EQ(list[2]->pdpType(), 7);
  EXPECT_FALSE(list[2]->pdpAddr());
}

TEST(EsmMessages, tellAConnectionThatEnds) {
  AirModem modem;
  modem.nas(kEsmIn, activateConnection({.bearer = 5}));
  modem.nas(kEsmIn, activateConnection({.bearer = 6, .apn = "ims"}));
  EXPECT_EQ(modem.nas(kEsmIn, deactivateBearer(5)), ToldMetrics{kBearers});
  ASSERT_EQ(connections(modem).size(), 1U);
  EXPECT_EQ(connections(modem)[0]->apn(), "ims");
  EXPECT_EQ(modem.nas(kEsmOut, rejectActivation(6)), ToldMetrics{kBearers});
  EXPECT_TRUE(connections(modem).empty());
}

TEST(EsmMessages, aboutDedicatedBearersTellNothing) {
  AirModem modem;
  modem.nas(kEsmIn, activateConnection({.bearer = 5}));
  EXPECT_TRUE(modem.nas(kEsmIn, Bytes{0x62, 0, 0xC5, 0x05, 1, 1, 1, 1}).empty());
  EXPECT_TRUE(modem.nas(kEsmIn, deactivateBearer(6)).empty());
  EXPECT_EQ(connections(modem).size(), 1U);
}

TEST(EsmMessages, aboutTheEndOfOneThatWasNotSeenTellNothing) {
  AirModem modem;
  EXPECT_TRUE(modem.nas(kEsmIn, deactivateBearer(5)).empty());
  EXPECT_FALSE(modem.reader().report(kBearers, 1)) << "whether there are others is not known";
}

TEST(EsmMessages, replaceAConnectionOfTheSameBearer) {
  AirModem modem;
  modem.nas(kEsmIn, activateConnection({.bearer = 5, .apn = "a"}));
  modem.nas(kEsmIn, activateConnection({.bearer = 5, .apn = "b"}));
  ASSERT_EQ(connections(modem).size(), 1U);
  EXPECT_EQ(connections(modem)[0]->apn(), "b");
}

TEST(EsmMessages, withoutABearerAreDamaged) {
  AirModem modem;
  EXPECT_TRUE(modem.nas(kEsmIn, activateConnection({.bearer = 4})).empty());
  EXPECT_EQ(modem.damaged(), 1U);
}

TEST(BearerPackets, areLookedAtAndTellNothing) {
  AirModem modem;
  EXPECT_TRUE(modem.send(0xB0E4, Bytes{1, 5, 2, 1}).empty());
  EXPECT_TRUE(modem.send(0xB0E5, BodyWriter().u8(1).zeros(19).written()).empty());
  EXPECT_EQ(modem.reader().counts().total().notOurs, 2U);
  EXPECT_TRUE(modem.send(0xB0E4, Bytes{1, 5, 2}).empty());
  EXPECT_TRUE(modem.send(0xB0E5, BodyWriter().u8(1).zeros(18).written()).empty());
  EXPECT_EQ(modem.damaged(), 2U);
  EXPECT_TRUE(modem.send(0xB0E5, BodyWriter().u8(2).zeros(19).written()).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

}  // namespace
}  // namespace qel::diagnostics
