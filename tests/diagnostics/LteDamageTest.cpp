// LTE's logs cut off anywhere and damaged anyhow.

#include <gtest/gtest.h>

#include <random>

#include "messages/catalogue/MetricMessages.h"
#include "sources/diagnostics/lte/LevelCheck.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using test::LteModem;
using namespace test;  // NOLINT(google-build-using-namespace): of bodies

struct Whole {
  std::uint16_t code;
  Bytes body;
};

const std::vector<WrittenLteCell> kCells = {
    {185, {heard(-108, -82, 50, 8), heard(-118, -91, 50, 4)}},
};
const std::vector<WrittenLteCell> kListed = {
    {173, {heard(-116.5, -90, 8), heard(-113, -88, 8)}},
    {210, {heard(-119, -92, 8), heard(-118, -91, 8)}},
};
const std::vector<WrittenLteLevel> kLevels = {{173, -113, -16}, {503, -121, -16}};

std::vector<Whole> wholePackets() {
  std::vector<Whole> whole = {
      {0xB0C1, lteMasterInformation(1)}, {0xB0C1, lteMasterInformation(2)},
      {0xB0C1, lteMasterInformation(3)}, {0xB0C2, lteServingCell(2)},
      {0xB0C2, lteServingCell(3)},       {0xB197, lteFoundCell(1)},
      {0xB197, lteFoundCell(2)},
  };
  for (const unsigned version : {4U, 5U, 25U}) {
    whole.push_back({0xB16E, ltePusch(version, {{1, 23}, {9, -40}})});
  }
  for (const unsigned version : {4U, 24U}) {
    whole.push_back({0xB16F, ltePucch(version, {{1, 3}, {9, -4}})});
  }
  for (const unsigned version : {3U, 4U}) {
    whole.push_back({0xB179, lteConnectedCells(version, 5780, {185, -108, -8}, kLevels)});
  }
  for (const unsigned version : {4U, 5U}) {
    whole.push_back({0xB17F, lteIdleServing(version, 5780, {185, -98, -9})});
    whole.push_back({0xB180, lteIdleIntra(version, 5780, kLevels)});
  }
  for (const unsigned version : kLteListedVersions) {
    whole.push_back({0xB192, lteIdleNeighbours(version, 5780, kListed)});
    whole.push_back({0xB195, lteConnectedNeighbours(version, 5780, kListed)});
  }
  for (const unsigned version : kLteMeasurementVersions) {
    whole.push_back({0xB193, lteMeasurement(version, 5780, kCells)});
  }
  return whole;
}

bool knowsNothing(const LteModem& modem) {
  const LtePicture& lte = modem.reader().picture().lte;
  return !lte.serving && !lte.camped && !lte.broadcast && !lte.signal &&
         lte.neighbours.cells().empty() && lte.pusch.list.empty() && lte.pucch.list.empty();
}

using Said = std::vector<std::string>;

Said saidOf(LteModem& modem, const Whole& packet) {
  Said said;
  for (const std::uint32_t metric : modem.send(packet.code, packet.body)) {
    said.push_back(modem.said(metric));
  }
  return said;
}

// Behind the last thing that is read a few bytes may stand that are not.
TEST(LtePackets, cutOffAnywhereTellNothingOrWhatTheyTellWhole) {
  for (const Whole& whole : wholePackets()) {
    LteModem all;
    const Said told = saidOf(all, whole);
    EXPECT_EQ(all.understood(), 1U) << whole.code;
    EXPECT_FALSE(knowsNothing(all)) << whole.code;
    std::size_t damaged = 0;
    for (std::size_t length = 0; length < whole.body.size(); ++length) {
      // A buffer of just that size: a byte past the end is seen.
      const Bytes cut(whole.body.begin(), whole.body.begin() + static_cast<long>(length));
      LteModem modem;
      const Said said = saidOf(modem, {whole.code, cut});
      damaged += modem.damaged();
      EXPECT_EQ(modem.damaged() + modem.understood(), 1U) << whole.code << ' ' << length;
      EXPECT_EQ(said, modem.understood() > 0 ? told : Said()) << whole.code << ' ' << length;
      EXPECT_EQ(knowsNothing(modem), modem.understood() == 0) << whole.code << ' ' << length;
    }
    EXPECT_GE(damaged + 24, whole.body.size()) << whole.code;
  }
}

void expectLikely(const LteModem& modem) {
  const LtePicture& lte = modem.reader().picture().lte;
  if (lte.serving) {
    EXPECT_TRUE(isCell(lte.serving->name));
    EXPECT_LE(lte.serving->mnc, 999U);
  }
  EXPECT_TRUE(!lte.camped || isCell(*lte.camped));
  EXPECT_TRUE(!lte.signal || serverAgrees(lte.signal->antennas));
  for (const LteNeighbour& cell : lte.neighbours.cells()) EXPECT_TRUE(isCell(cell.cell));
  for (const LteTransmission& sent : lte.pusch.list) EXPECT_LE(sent.subframe, 9U);
}

TEST(LtePackets, damagedAnyhowMakeOnlyReportsThatCanBeRead) {
  std::mt19937 random(36331);
  LteModem modem;
  const auto packets = wholePackets();
  for (int round = 0; round < 1000; ++round) {
    for (const Whole& whole : packets) {
      Bytes body = whole.body;
      for (unsigned i = 0; i <= random() % 4; ++i) {
        body[random() % body.size()] ^= static_cast<std::uint8_t>(1U << random() % 8);
      }
      body.resize(body.size() - random() % 2);
      body.shrink_to_fit();
      for (const std::uint32_t metric : modem.send(whole.code, body)) {
        const auto payload = modem.reader().report(metric, 1);
        ASSERT_TRUE(payload) << metric;
        EXPECT_TRUE(findMetricMessage(metric)->isReadable(*payload)) << metric;
      }
    }
    expectLikely(modem);
    modem.wait(random() % 5000);
  }
  EXPECT_GT(modem.understood(), 0U);
  EXPECT_GT(modem.damaged(), 0U);
  EXPECT_GT(modem.ofUnknownVersion(), 0U);
}

TEST(LtePackets, ofNoiseTellNothingOfLevels) {
  std::mt19937 random(193);
  std::size_t told = 0;
  for (int round = 0; round < 20'000; ++round) {
    Bytes body = lteMeasurementCalled(26, 66, 5780, kCells);
    for (std::size_t i = 20; i < body.size(); ++i) body[i] = static_cast<std::uint8_t>(random());
    body[24] = 1;  // one cell: the likeliest to pass
    body[25] = body[26] = body[27] = 0;
    LteModem modem;
    told += modem.send(0xB193, body).size();
  }
  EXPECT_EQ(told, 0U);
}

}  // namespace
}  // namespace qel::diagnostics
