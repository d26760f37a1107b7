// The head of the packets that carry LTE's RRC messages, in every version.
#include <gtest/gtest.h>

#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages

constexpr auto kState = metric::kLteRrcState;

class LteOverTheAir : public ::testing::TestWithParam<unsigned> {};
INSTANTIATE_TEST_SUITE_P(OfVersion, LteOverTheAir, ::testing::ValuesIn(airVersions()));

TEST_P(LteOverTheAir, tellsCellAndMessageOnEachChannel) {
  AirModem modem;
  const AirCell cell = {GetParam() < 8 ? 1300U : 66786U, 301};
  const auto send = [&](AirChannel channel, const Bytes& message) {
    return modem.send(kOverTheAir, overTheAir(GetParam(), channel, message, cell));
  };
  EXPECT_EQ(send(AirChannel::bcchDlSch, sib1Message({})), ToldMetrics{metric::kLteSelRes});
  EXPECT_EQ(send(AirChannel::ulCcch, connectionRequest(3)), ToldMetrics{kState});
  EXPECT_EQ(send(AirChannel::ulDcch, setupComplete()), ToldMetrics{kState});
  EXPECT_EQ(send(AirChannel::dlDcch, connectionRelease(1)), ToldMetrics{kState});
  EXPECT_EQ(send(AirChannel::dlCcch, plainSetup()), ToldMetrics{kState});
  EXPECT_EQ(modem.understood(), 5U);
  const auto& lte = modem.reader().picture().lte;
  EXPECT_EQ(lte.rules->cell, (LteCellName{cell.earfcn, cell.pci}));
  EXPECT_EQ(lte.camped, (LteCellName{cell.earfcn, cell.pci}));
}

TEST_P(LteOverTheAir, passesOverPagingAndBroadcastsThatTellNothing) {
  AirModem modem;
  for (const auto channel : {AirChannel::bcchBch, AirChannel::mcch, AirChannel::pcch}) {
    modem.send(kOverTheAir, overTheAir(GetParam(), channel, Bytes(4), {}));
  }
  EXPECT_EQ(modem.reader().counts().total().notOurs, 3U);
}

TEST_P(LteOverTheAir, isDamagedWhenItsLengthIsNotExact) {
  const Bytes whole = overTheAir(GetParam(), AirChannel::ulCcch, connectionRequest(3), {});
  AirModem modem;
  for (std::size_t length = 0; length < whole.size(); ++length) {
    EXPECT_TRUE(modem.send(kOverTheAir, ByteView(whole).first(length)).empty());
  }
  Bytes longer = whole;
  longer.push_back(0);
  EXPECT_TRUE(modem.send(kOverTheAir, longer).empty());
  EXPECT_EQ(modem.damaged(), whole.size() + 1);
}

TEST(LteOverTheAir, ofUnknownVersionsTellsNothing) {
  AirModem modem;
  for (const unsigned version : {0U, 1U, 10U, 11U, 17U, 18U, 21U, 23U, 28U, 32U, 255U}) {
    EXPECT_TRUE(
        modem.send(kOverTheAir, overTheAir(version, AirChannel::ulCcch, connectionRequest(3), {}))
            .empty());
  }
  EXPECT_EQ(modem.ofUnknownVersion(), 11U);
}

TEST(LteOverTheAir, ofNarrowbandIsNotOurs) {
  AirModem modem;
  for (unsigned number = 45; number <= 61; ++number) {
    Bytes body = overTheAir(19, AirChannel::ulCcch, connectionRequest(3), {});
    body[12] = static_cast<std::uint8_t>(number);
    EXPECT_TRUE(modem.send(kOverTheAir, body).empty());
  }
  EXPECT_EQ(modem.reader().counts().total().notOurs, 17U);
}

TEST(LteOverTheAir, takesWholeMessagesOnly) {
  AirModem modem;
  for (unsigned segment = 1; segment < 8; ++segment) {
    EXPECT_TRUE(modem
                    .send(kOverTheAir,
                          overTheAir(30, AirChannel::ulCcch, connectionRequest(3), {}, segment))
                    .empty());
  }
  EXPECT_EQ(modem.reader().counts().total().notOurs, 7U);
}

TEST(LteOverTheAir, withAMessageThatEndsEarlyIsDamaged) {
  AirModem modem;
  EXPECT_TRUE(modem.air(AirChannel::ulCcch, Bytes{0x40}).empty());
  EXPECT_EQ(modem.damaged(), 1U);
}

TEST(LteOverTheAir, ofACellThatCannotBeIsDamaged) {
  AirModem modem;
  const auto isDamaged = [&](const AirCell& cell) {
    const auto before = modem.damaged();
    return modem.air(AirChannel::ulCcch, connectionRequest(3), cell).empty() &&
           modem.damaged() == before + 1;
  };
  EXPECT_TRUE(isDamaged({.earfcn = 1300, .pci = 504}));
  EXPECT_TRUE(isDamaged({.earfcn = 262144, .pci = 185}));
  EXPECT_EQ(modem.reader().picture().lte.camped, std::nullopt);
  EXPECT_FALSE(isDamaged({.earfcn = 262143, .pci = 503}));
}

}  // namespace
}  // namespace qel::diagnostics
