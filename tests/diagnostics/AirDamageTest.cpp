// Messages of the non-access stratum and of RRC cut off anywhere and damaged anyhow.
#include <gtest/gtest.h>

#include <random>

#include "messages/catalogue/MetricMessages.h"
#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages

struct Whole {
  std::uint16_t code;
  Bytes body;
};

std::vector<Whole> nasPackets() {
  std::vector<Whole> packets = {{kEmmState, emmState(3, 0, WrittenGuti{})}};
  const auto add = [&](std::uint16_t code, const Bytes& message) {
    packets.push_back({code, plainNas(message)});
  };
  add(kEmmOut, attachRequest(2));
  add(kEmmIn, attachAccept(0x49, areasValue({5, 9}),
                           {gutiElement({}), equivalentsElement({0x62F210}),
                            featuresElement(true, true), Bytes{0x53, 18}, Bytes{0xF2}}));
  add(kEmmIn, updateAccept({Bytes{0x5A, 0x49}, gutiElement({}), Bytes{0x57, 2, 0x20, 0}}));
  add(kEmmIn, updateReject(12));
  add(kEmmIn, detachRequest(1));
  add(kEsmIn, activateConnection({.nameServers = {{192, 0, 2, 1}, Bytes(16, 9)}}));
  add(kEsmIn, deactivateBearer(5));
  return packets;
}

std::vector<Whole> airPackets() {
  std::vector<Whole> packets;
  const auto add = [&](AirChannel channel, const Bytes& message) {
    packets.push_back({kOverTheAir, overTheAir(channel, message)});
    packets.push_back({kOverTheAir, overTheAir(30, channel, message, {})});
  };
  add(AirChannel::bcchDlSch,
      sib1Message({.tdd = AirTdd{2, 7}, .ofRelease9 = true, .bands = {66, 10}}));
  add(AirChannel::bcchDlSch, sib2Message(true, AirBarring{12, 5, 17}));
  add(AirChannel::bcchDlSch, sib3Message({}));
  add(AirChannel::bcchDlSch, sib5Message({{.earfcn = 40936, .priority = 6}, {.earfcn = 700}}));
  add(AirChannel::ulCcch, connectionRequest(3));
  add(AirChannel::ulCcch, reestablishmentRequest(301, 2));
  add(AirChannel::dlCcch, setupWithDrx(AirDrx{}));
  add(AirChannel::ulDcch, setupComplete());
  add(AirChannel::dlDcch, measureConfiguration({{.object = 3, .earfcn = 700, .identity = 2}}));
  add(AirChannel::dlDcch, secondaryCells({3}, {{1, 301, 700}, {2, 77, 40936}}));
  add(AirChannel::dlDcch, handover(77, 2300));
  add(AirChannel::ulDcch, measurementReport(2, {AirResult{301, 55, 15}}));
  add(AirChannel::ulDcch, measurementReport(1, {AirUmtsResult{444, 20, 30}}));
  add(AirChannel::ulDcch, measurementReport(2, {AirGsmResult{620, 5, 3, 40}}));
  add(AirChannel::dlDcch, connectionRelease(1));
  return packets;
}

std::vector<Whole> allPackets() {
  std::vector<Whole> packets = airPackets();
  for (Whole& one : nasPackets()) packets.push_back(std::move(one));
  return packets;
}

constexpr auto kReports = std::to_array<std::uint32_t>(
    {metric::kLteRrcState, metric::kLteCdrxConfig, metric::kLteSelRes, metric::kLteNeighbours,
     metric::kLteInterRat, metric::kLteCarrierAggregation, metric::kLteComponentCarriers,
     metric::kEmmContext, metric::kBearers, metric::kMmCommonInfo});

std::vector<std::string> sayings(const AirModem& modem) {
  std::vector<std::string> all;
  for (const std::uint32_t metric : kReports) all.push_back(modem.said(metric));
  return all;
}

AirModem fullModem() {
  AirModem modem;
  for (const Whole& packet : nasPackets()) modem.send(packet.code, packet.body);
  for (const Whole& packet : airPackets()) modem.send(packet.code, packet.body);
  return modem;
}

// Each packet must be whole to be judged here: cut, it is counted as damaged and changes nothing.
TEST(AirAndNasPackets, cutOffAnywhereChangeNothing) {
  const AirModem before = fullModem();
  const auto known = sayings(before);
  for (const Whole& packet : airPackets()) {
    for (std::size_t length = 0; length < packet.body.size(); ++length) {
      AirModem modem = before;
      EXPECT_TRUE(modem.send(packet.code, ByteView(packet.body).first(length)).empty());
      ASSERT_EQ(sayings(modem), known);
    }
  }
}

// Optional elements may end anywhere; what is left is either whole or tells nothing.
TEST(AirAndNasPackets, ofNasCutOffAnywhereAreWholeOrChangeNothing) {
  const AirModem before = fullModem();
  const auto known = sayings(before);
  for (const Whole& packet : nasPackets()) {
    for (std::size_t length = 0; length < packet.body.size(); ++length) {
      AirModem modem = before;
      const auto told = modem.send(packet.code, ByteView(packet.body).first(length));
      if (modem.damaged() > before.damaged()) {
        EXPECT_TRUE(told.empty());
        ASSERT_EQ(sayings(modem), known);
      }
    }
  }
}

TEST(AirAndNasPackets, damagedAnyhowMakeOnlyReportsThatCanBeRead) {
  std::mt19937 random(20);
  const auto packets = allPackets();
  AirModem modem;
  for (int round = 0; round < 40'000; ++round) {
    const Whole& packet = packets[random() % packets.size()];
    Bytes body = packet.body;
    for (std::size_t left = random() % 4; left > 0; --left) {
      body[random() % body.size()] ^= static_cast<std::uint8_t>(1U << random() % 8);
    }
    modem.send(0xB0FF, {});  // tells that time has gone by
    const auto known = round % 50 == 0 ? sayings(modem) : std::vector<std::string>{};
    const std::uint64_t damaged = modem.damaged();
    for (const std::uint32_t metric : modem.send(packet.code, body)) {
      const auto payload = modem.reader().report(metric, 1);
      const MetricMessage* message = findMetricMessage(metric);
      ASSERT_TRUE(payload || metric == metric::kMmCommonInfo);
      if (payload && message) {
        ASSERT_TRUE(message->describe(*payload)) << metric;
      }
    }
    if (!known.empty() && modem.damaged() > damaged) {
      ASSERT_EQ(sayings(modem), known) << "a damaged packet";
    }
    modem.wait(random() % 100);
  }
  EXPECT_GT(modem.damaged(), 1000U);
  EXPECT_GT(modem.understood(), 1000U);
}

}  // namespace
}  // namespace qel::diagnostics
