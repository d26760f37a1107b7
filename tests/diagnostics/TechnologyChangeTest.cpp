// What was known of cells of one technology is gone when the phone goes to another.
#include <gtest/gtest.h>

#include <span>

#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"
#include "support/diagnostics/GsmPackets.h"
#include "support/diagnostics/LtePackets.h"
#include "support/diagnostics/Packets.h"
#include "support/diagnostics/UmtsMessages.h"
#include "support/diagnostics/UmtsPackets.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages

constexpr std::uint16_t kLteCell = 0xB0C2;
constexpr std::uint16_t kLteMeasurement = 0xB193;
constexpr std::uint16_t kUmtsCell = 0x4127;
constexpr std::uint16_t kUmtsMessage = 0x412F;
constexpr std::uint16_t kGsmCell = 0x5134;
constexpr std::uint16_t kGsmMessage = 0x512F;

Bytes gsmCell() {
  const Bytes network = area("00101", 0x1234);
  return BodyWriter().u16(8U << 12 | 62U).u8(3).u8(5).u16(0xABCD).bytes(network).u8(1).u8(0xFF);
}

Bytes gsmBroadcast() {
  return radioMessage(RadioChannel::broadcast, systemInformation3(Broadcast{}), 18);
}

void beOnLte(AirModem& modem) {
  const AirCell cell = {.earfcn = 5780, .pci = 185};
  modem.send(kLteCell, lteServingCell(3));
  modem.send(kLteMeasurement,
             lteMeasurement(24, 5780, {{185, {heard(-108, -82, 50), heard(-118, -91, 50)}}}));
  modem.send(0xB180, lteIdleIntra(5, 5780, {{173, -113, -16}}));
  modem.air(AirChannel::bcchDlSch, sib1Message({}), cell);
  modem.air(AirChannel::dlCcch, setupWithDrx(AirDrx{}), cell);
  modem.air(AirChannel::dlDcch, secondaryCells({}, {{1, 301, 700}}), cell);
}
constexpr std::uint32_t kOfLte[] = {metric::kLteScellInfo,          metric::kLteSelRes,
                                    metric::kLteRsrpRsrqSinr,       metric::kLteServingMeasurement,
                                    metric::kLteNeighbours,         metric::kLteCdrxConfig,
                                    metric::kLteCarrierAggregation, metric::kLteComponentCarriers};

void beOnUmts(AirModem& modem) {
  Bytes block = umtsBlock5(true, false).bytes();
  block.insert(block.begin(), 5);
  modem.send(kUmtsCell, umtsCell());
  modem.send(kUmtsMessage, umtsRrc(9, block));
  modem.send(0x4005, umtsRanks(0, {{.scramblingCode = 407, .rscpDbm = -80, .ecnoDb = -6}}));
}
constexpr std::uint32_t kOfUmts[] = {metric::kUmtsCellInfo, metric::kUmtsSelRes,
                                     metric::kUmtsServingMeasurement, metric::kUmtsNeighbours};

void beOnGsm(AirModem& modem) {
  modem.send(kGsmCell, gsmCell());
  modem.send(kGsmMessage, gsmBroadcast());
}
constexpr std::uint32_t kOfGsm[] = {metric::kGsmScellInfo, metric::kGsmIdleConfig,
                                    metric::kGsmGprsConfig};

void expectKnown(const AirModem& modem, std::span<const std::uint32_t> metrics, bool known) {
  for (const std::uint32_t metric : metrics)
    EXPECT_EQ(!modem.said(metric).empty(), known) << metric;
}

TEST(TechnologyChange, toUmtsEndsWhatWasKnownOfLte) {
  AirModem modem;
  beOnLte(modem);
  expectKnown(modem, kOfLte, true);
  beOnUmts(modem);
  expectKnown(modem, kOfLte, false);
  expectKnown(modem, kOfUmts, true);
}

TEST(TechnologyChange, toGsmEndsWhatWasKnownOfUmts) {
  AirModem modem;
  beOnUmts(modem);
  beOnGsm(modem);
  expectKnown(modem, kOfUmts, false);
  expectKnown(modem, kOfGsm, true);
}

TEST(TechnologyChange, toLteEndsWhatWasKnownOfGsm) {
  AirModem modem;
  beOnGsm(modem);
  beOnLte(modem);
  expectKnown(modem, kOfGsm, false);
  expectKnown(modem, kOfLte, true);
}

TEST(TechnologyChange, isNotALookAroundInGsm) {
  AirModem modem;
  beOnLte(modem);
  modem.send(kGsmMessage, gsmBroadcast());
  EXPECT_EQ(modem.reader().picture().technology, Technology::lte);
  expectKnown(modem, kOfLte, true);
  modem.send(kGsmCell, gsmCell());
  EXPECT_EQ(modem.reader().picture().technology, Technology::gsm);
  expectKnown(modem, kOfLte, false);
  expectKnown(modem, kOfGsm, true);
}

TEST(TechnologyChange, isNotAMeasurementOfLte) {
  AirModem modem;
  beOnUmts(modem);
  modem.send(kLteMeasurement, lteMeasurement(24, 5780, {{185, {heard(-108, -82, 50)}}}));
  EXPECT_EQ(modem.reader().picture().technology, Technology::umts);
  expectKnown(modem, kOfUmts, true);
}

}  // namespace
}  // namespace qel::diagnostics
