// How the serving cell is received on LTE, from every version of its measurement.

#include <gtest/gtest.h>

#include "sources/diagnostics/lte/SignalLogs.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using test::deaf;
using test::heard;
using test::lteMeasurement;
using test::lteMeasurementCalled;
using test::LteModem;
using test::WrittenLteCell;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kMeasurement = 0xB193;
constexpr std::uint32_t kReceivers = 54017;
constexpr std::uint32_t kSamples = 20330;
constexpr std::uint32_t kCarriers = 54035;

const WrittenLteCell kCell = {185, {heard(-108, -82, 50, 8.3), heard(-118, -91, 50, -4)}};

std::string receivers(const LteModem& modem) { return modem.said(kReceivers); }

bool writesSnr(unsigned version) { return version < 60; }

class LteMeasurementOfVersion : public ::testing::TestWithParam<unsigned> {};

TEST_P(LteMeasurementOfVersion, tellsTheReceivers) {
  LteModem modem;
  EXPECT_EQ(modem.send(kMeasurement, lteMeasurement(GetParam(), 5780, {kCell})),
            (Metrics{kReceivers, kSamples}));
  EXPECT_EQ(receivers(modem),
            writesSnr(GetParam())
                ? R"({"rx_info": [{"rssi": -82, "rsrp_range": 32, "rsrq_range": 21, "snr": 8}, )"
                  R"({"rssi": -91, "rsrp_range": 22, "rsrq_range": 19, "snr": -4}]})"
                : R"({"rx_info": [{"rssi": -82, "rsrp_range": 32, "rsrq_range": 21}, )"
                  R"({"rssi": -91, "rsrp_range": 22, "rsrq_range": 19}]})");
}

TEST_P(LteMeasurementOfVersion, tellsOneSampleThatIsItsOwnAverage) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(GetParam(), 5780, {kCell}));
  const std::string sample =
      writesSnr(GetParam())
          ? R"({"phy_cell_id": 185, "rsrp0": -108, "rsrp1": -118, "rsrq0": -9, "rsrq1": -10, )"
            R"("sinr0": 17, "sinr1": -8})"
          : R"({"phy_cell_id": 185, "rsrp0": -108, "rsrp1": -118, "rsrq0": -9, "rsrq1": -10})";
  EXPECT_EQ(modem.said(kSamples), R"({"num_samples": 1, "avg_values": )" + sample +
                                      R"(, "inst_values": [)" + sample + "]}");
}

TEST_P(LteMeasurementOfVersion, leavesOutAnAntennaThatIsNotThere) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(GetParam(), 5780, {{7, {heard(-90, -62, 100)}}}));
  const auto& signal = modem.reader().picture().lte.signal;
  ASSERT_TRUE(signal);
  EXPECT_EQ(signal->cell, (LteCellName{5780, 7}));
  EXPECT_TRUE(signal->antennas[0]);
  EXPECT_FALSE(signal->antennas[1]);
  EXPECT_FALSE(signal->antennas[2]);
  EXPECT_FALSE(signal->antennas[3]);
}

TEST_P(LteMeasurementOfVersion, keepsThePlaceOfAnAntennaBehindOneThatIsNotThere) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(GetParam(), 5780, {{7, {deaf(), heard(-90, -62, 100)}}}));
  const std::string said = receivers(modem);
  EXPECT_EQ(said.rfind(R"({"rx_info": [{}, {"rssi": -62, "rsrp_range": 50)", 0), 0U) << said;
}

TEST_P(LteMeasurementOfVersion, tellsNothingWhenTheLevelsDisagree) {
  WrittenLteCell cell = kCell;
  cell.antennas[1].rsrqDb += 1;
  LteModem modem;
  EXPECT_TRUE(modem.send(kMeasurement, lteMeasurement(GetParam(), 5780, {cell})).empty());
  EXPECT_EQ(modem.damaged(), 1U);
  EXPECT_EQ(receivers(modem), "");
}

TEST_P(LteMeasurementOfVersion, tellsNothingWhenTheAntennasAreOfDifferentBandwidths) {
  const WrittenLteCell cell = {185, {heard(-108, -82, 50), heard(-118, -91, 25)}};
  LteModem modem;
  EXPECT_TRUE(modem.send(kMeasurement, lteMeasurement(GetParam(), 5780, {cell})).empty());
}

TEST_P(LteMeasurementOfVersion, isReadUnderEveryBandwidth) {
  for (const unsigned blocks : {6U, 15U, 25U, 50U, 75U, 100U}) {
    LteModem modem;
    const WrittenLteCell cell = {1, {heard(-100, -68, blocks), heard(-99.4, -66.9, blocks)}};
    EXPECT_FALSE(modem.send(kMeasurement, lteMeasurement(GetParam(), 1, {cell})).empty());
  }
}

TEST_P(LteMeasurementOfVersion, isReadWithAQualityAtItsFloor) {
  WrittenLteCell cell = {1, {heard(-128, -78, 50), heard(-119, -80, 50)}};
  ASSERT_LT(cell.antennas[0].rsrqDb, -30);
  cell.antennas[0].rsrqDb = -30;
  LteModem modem;
  EXPECT_FALSE(modem.send(kMeasurement, lteMeasurement(GetParam(), 1, {cell})).empty());
}

INSTANTIATE_TEST_SUITE_P(Known, LteMeasurementOfVersion,
                         ::testing::ValuesIn(test::kLteMeasurementVersions));

TEST(LteMeasurement, tellsFourReceiversWhereThereAreFour) {
  const WrittenLteCell cell = {
      3, {heard(-80, -50, 75), heard(-81, -51, 75), heard(-82, -52, 75), heard(-83, -53, 75)}};
  for (const unsigned version : {35U, 36U, 40U, 48U, 50U, 60U, 66U}) {
    LteModem modem;
    modem.send(kMeasurement, lteMeasurement(version, 1, {cell}));
    const auto& signal = modem.reader().picture().lte.signal;
    ASSERT_TRUE(signal) << version;
    for (std::size_t i = 0; i < 4; ++i) {
      ASSERT_TRUE(signal->antennas[i]) << version << ' ' << i;
      EXPECT_EQ(signal->antennas[i]->rsrpDbm, -80.0 - static_cast<double>(i)) << version;
    }
  }
}

// Several cells: the one that serves, and those of configured carriers.

const WrittenLteCell kSecond = {182, {heard(-95, -67, 75), heard(-97, -69, 75)}, 1};

TEST(LteMeasurement, tellsTheCellThatServes) {
  WrittenLteCell other = kCell;
  other.pci = 10;
  other.serves = false;
  for (const unsigned version : {19U, 22U, 24U, 35U, 36U, 40U, 48U, 50U, 60U, 66U}) {
    LteModem modem;
    modem.send(kMeasurement, lteMeasurement(version, 5780, {other, kSecond, kCell}));
    ASSERT_TRUE(modem.reader().picture().lte.signal) << version;
    EXPECT_EQ(modem.reader().picture().lte.signal->cell.pci, 185U) << version;
  }
}

TEST(LteMeasurement, ofAnUnknownCarrierTellsNothing) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kMeasurement, lteMeasurement(22, 1300, {kSecond})).empty());
  EXPECT_EQ(modem.understood(), 1U);
  EXPECT_EQ(receivers(modem), "");
}

TEST(LteMeasurement, tellsACarriersLevelsOnceTheNetworkConfiguredIt) {
  Picture picture;
  SecondaryCarrier& carrier = picture.lte.carriers.emplace_back();
  carrier.index = 1;
  carrier.pci = 182;
  Told told;
  const Bytes body = lteMeasurement(22, 1300, {kSecond});
  EXPECT_EQ(readLteMeasurement({kMeasurement, 5, 0, body}, picture, told), Outcome::understood);
  EXPECT_EQ(Metrics(told.begin(), told.end()), Metrics{kCarriers});
  EXPECT_EQ(carrier.active, true);
  ASSERT_TRUE(carrier.signal);
  EXPECT_EQ(carrier.signal->antennas[1]->rsrpDbm, -97);
}

TEST(LteMeasurement, takesNothingFromACellThatFailsBesideOneThatFits) {
  WrittenLteCell wrong = kCell;
  wrong.pci = 10;
  wrong.antennas[0].rssiDbm += 5;
  LteModem modem;
  EXPECT_FALSE(modem.send(kMeasurement, lteMeasurement(48, 5780, {wrong, kCell})).empty());
  EXPECT_EQ(modem.reader().picture().lte.signal->cell.pci, 185U);
}

TEST(LteMeasurement, tellsNothingOfACellNumberThatNoneHas) {
  LteModem modem;
  WrittenLteCell cell = kCell;
  cell.pci = 504;
  EXPECT_TRUE(modem.send(kMeasurement, lteMeasurement(36, 5780, {cell})).empty());
}

// Versions that are not known.

TEST(LteMeasurement, ofAnUnknownVersionIsReadByAKnownLayoutThatFits) {
  for (const unsigned version : test::kLteMeasurementVersions) {
    for (const unsigned name : {26U, 59U, 77U}) {
      LteModem modem;
      EXPECT_EQ(modem.send(kMeasurement, lteMeasurementCalled(name, version, 5780, {kCell})),
                (Metrics{kReceivers, kSamples}))
          << version << " called " << name;
      EXPECT_EQ(modem.reader().picture().lte.signal->antennas[0]->rsrpDbm, -108);
    }
  }
}

TEST(LteMeasurement, ofAKnownVersionThatDoesNotFitIsReadByOneThatDoes) {
  LteModem modem;
  EXPECT_EQ(modem.send(kMeasurement, lteMeasurementCalled(4, 40, 5780, {kCell})),
            (Metrics{kReceivers, kSamples}));
  EXPECT_EQ(modem.reader().picture().lte.signal->antennas[0]->rsrpDbm, -108);
}

TEST(LteMeasurement, ofAnUnknownVersionThatNoLayoutFitsTellsNothing) {
  WrittenLteCell cell = kCell;
  cell.antennas[0].rsrqDb -= 1;
  LteModem modem;
  EXPECT_TRUE(modem.send(kMeasurement, lteMeasurementCalled(26, 24, 5780, {cell})).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(LteMeasurement, ofAnUnknownVersionIsNotJudgedByOneAntenna) {
  LteModem modem;
  const WrittenLteCell cell = {7, {heard(-90, -62, 100)}};
  EXPECT_TRUE(modem.send(kMeasurement, lteMeasurementCalled(26, 24, 5780, {cell})).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(LteMeasurement, isCountedByTheVersionOfItsResult) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(36, 5780, {kCell}));
  const auto& rows = modem.reader().counts().rows();
  ASSERT_EQ(rows.size(), 1U);
  EXPECT_EQ(rows.begin()->first.version, 36U);
}

TEST(LteMeasurement, withoutAResultTellsNothing) {
  LteModem modem;
  Bytes body = lteMeasurement(36, 5780, {kCell});
  body[1] = 1;  // the first part alone
  EXPECT_TRUE(modem.send(kMeasurement, body).empty());
  EXPECT_EQ(modem.reader().counts().total().notOurs, 1U);
}

TEST(LteMeasurement, inAnotherEnvelopeTellsNothing) {
  LteModem modem;
  Bytes body = lteMeasurement(36, 5780, {kCell});
  body[0] = 2;
  EXPECT_TRUE(modem.send(kMeasurement, body).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(LteMeasurement, isForgottenAfterTenSeconds) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(36, 5780, {kCell}));
  modem.wait(10'000);
  modem.send(0xB0FF, {});
  EXPECT_NE(receivers(modem), "");
  modem.wait(1);
  modem.send(0xB0FF, {});
  EXPECT_EQ(receivers(modem), "");
  EXPECT_EQ(modem.said(kSamples), "");
}

TEST(LteMeasurement, isForgottenWhenTheClockGoesBack) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(36, 5780, {kCell}));
  modem.setTime(315'964'807'000);
  modem.send(0xB0FF, {});
  EXPECT_EQ(receivers(modem), "");
}

TEST(LteMeasurement, tellsWhetherThePhoneIsConnectedOnceThatIsKnown) {
  constexpr std::uint16_t kStateEvent = 1606;
  LteModem modem;
  const Bytes measured = lteMeasurement(4, 5780, {kCell});
  modem.send(kMeasurement, measured);
  EXPECT_EQ(receivers(modem).find("is_connected_mode"), std::string::npos);
  modem.sendEvent(kStateEvent, Bytes{4});
  EXPECT_NE(receivers(modem).find(R"("is_connected_mode": true)"), std::string::npos)
      << receivers(modem);
  modem.sendEvent(kStateEvent, Bytes{2});
  EXPECT_NE(receivers(modem).find(R"("is_connected_mode": false)"), std::string::npos)
      << receivers(modem);
}

// A report on neighbours, once there was one, may be an empty list; before that there is none.
TEST(DiagnosticsReader, saysNothingOfWhatWasNeverTold) {
  LteModem modem;
  modem.send(kMeasurement, lteMeasurement(4, 5780, {kCell}));
  EXPECT_EQ(modem.said(54031), "");
  EXPECT_EQ(modem.said(kCarriers), "");
}

}  // namespace
}  // namespace qel::diagnostics
