// Cells, calls and levels of GSM, from the log to the metrics.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "messages/gsm.h"
#include "sources/Metrics.h"
#include "support/diagnostics/GsmPackets.h"
#include "support/diagnostics/ReportChecks.h"

namespace qel::diagnostics {
namespace {

using test::area;
using test::BodyWriter;
using test::Broadcast;
using test::Heart;
using test::RadioChannel;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::uint32_t kBand900 = 8U << 12;
constexpr std::uint32_t kBand1900 = 10U << 12;

Bytes ownCell(std::uint32_t word = kBand900 | 62, std::uint32_t cellId = 0xABCD) {
  return BodyWriter().u16(word).u8(3).u8(5).u16(cellId).bytes(area("00101", 0x1234)).u8(1).u8(0xFF);
}

Bytes type3(const Broadcast& cell = {}) {
  return radioMessage(RadioChannel::broadcast, systemInformation3(cell), 18);
}

KCellularGsmScellInfo cellOf(const Heart& heart) {
  return heart.report<KCellularGsmScellInfo>(metric::kGsmScellInfo);
}

// dBm in sixteenths, as 16 bits.
std::uint32_t sixteenths(double dbm) {
  return static_cast<std::uint32_t>(static_cast<std::int32_t>(dbm * 16)) & 0xFFFFU;
}

TEST(GsmCell, HasCarrierBandAndColourInTheModemsOwnWords) {
  Heart heart;
  EXPECT_THAT(heart.take(0x5134, ownCell()), ElementsAre(metric::kGsmScellInfo));
  const auto cell = cellOf(heart);
  EXPECT_EQ(cell.mcc(), 1U);
  EXPECT_EQ(cell.lac(), 0x1234U);
  EXPECT_EQ(cell.cellId(), 0xABCDU);
  EXPECT_EQ(cell.arfcn(), 62U);
  EXPECT_EQ(cell.gsmBand(), 45);
  EXPECT_EQ(cell.bsic(), 5U << 3 | 3U);
  EXPECT_FALSE(cell.hasState());
}

TEST(GsmCell, LiesInTheBandThatTheModemNames) {
  struct Case {
    std::uint32_t word;
    std::optional<std::int32_t> band;
  };
  const Case cases[] = {{8U << 12 | 0, 44},    {8U << 12 | 124, 45},  {8U << 12 | 960, 46},
                        {8U << 12 | 975, 44},  {9U << 12 | 512, 47},  {9U << 12 | 885, 47},
                        {10U << 12 | 512, 48}, {10U << 12 | 810, 48}, {11U << 12 | 128, 43},
                        {12U << 12 | 259, 40}, {12U << 12 | 340, 41}, {10U << 12 | 811, {}},
                        {8U << 12 | 128, {}},  {3U << 12 | 62, {}}};
  for (const Case& row : cases) {
    Heart heart;
    heart.take(0x5134, ownCell(row.word));
    const auto cell = cellOf(heart);
    EXPECT_EQ(cell.arfcn(), row.word & 0x3FFU);
    EXPECT_EQ(cell.hasGsmBand(), row.band.has_value()) << row.word;
    EXPECT_EQ(cell.gsmBand(), row.band.value_or(0)) << row.word;
  }
}

TEST(GsmCell, GoesTogetherWithWhatItBroadcasts) {
  Heart heart;
  heart.take(0x512F, type3());
  heart.take(0x5134, ownCell());
  const auto config = heart.report<KCellularGsmIdleConfig>(metric::kGsmIdleConfig);
  EXPECT_EQ(config.arfcnBcch(), 62U);
  EXPECT_EQ(config.bsic(), 5U << 3 | 3U);
  EXPECT_EQ(config.gsmBand(), 45U);
  EXPECT_EQ(config.t3212(), 20U);
}

TEST(GsmCell, KeepsItsCarrierFromOthers) {
  Heart heart;
  heart.take(0x5134, ownCell());
  Broadcast other;
  other.cellId = 9;
  heart.take(0x512F, type3(other));
  EXPECT_EQ(cellOf(heart).cellId(), 9U);
  EXPECT_FALSE(cellOf(heart).hasArfcn());
  heart.take(0x512F, type3());
  EXPECT_EQ(cellOf(heart).arfcn(), 62U);
}

TEST(GsmCell, HasAChannelOfItsOwnDuringACall) {
  Heart heart;
  heart.take(0x512F, type3());
  EXPECT_EQ(cellOf(heart).state(), 2);
  const Bytes slow = radioMessage(RadioChannel::slow, test::systemInformation6({}), 11);
  EXPECT_THAT(heart.take(0x512F, slow), ElementsAre(metric::kGsmScellInfo));
  EXPECT_EQ(cellOf(heart).state(), 1);
  EXPECT_THAT(heart.take(0x512F, slow), IsEmpty());
  const Bytes release = radioMessage(RadioChannel::standAlone, Bytes{0x06, 0x0D, 0x00});
  EXPECT_THAT(heart.take(0x512F, release), ElementsAre(metric::kGsmScellInfo));
  EXPECT_EQ(cellOf(heart).state(), 2);
}

TEST(GsmCell, IsANewOneAfterAHandover) {
  Heart heart;
  heart.take(0x512F, type3());
  Broadcast other;
  other.cellId = 0xBEEF;
  heart.take(0x512F, radioMessage(RadioChannel::slow, systemInformation6(other), 11));
  EXPECT_EQ(cellOf(heart).cellId(), 0xBEEFU);
  EXPECT_EQ(cellOf(heart).state(), 1);
}

TEST(GsmCall, HasTheLevelsOfTheReportToTheNetwork) {
  Heart heart;
  heart.take(0x5134, ownCell(kBand1900 | 600));
  const auto report = [&](bool valid) {
    return heart.take(0x512F,
                      radioMessage(RadioChannel::slow, test::measurementReport(37, 2, valid)));
  };
  EXPECT_THAT(report(false), IsEmpty());
  EXPECT_THAT(report(true), ElementsAre(metric::kGsmCallMeasurement));
  const auto call = heart.report<KCellularGsmCsRfMeasurement>(metric::kGsmCallMeasurement);
  EXPECT_EQ(call.csRxlevSub(), 37U);
  EXPECT_EQ(call.csRxqualSub(), 2U);
  EXPECT_EQ(call.scellArfcn(), 600U);
  EXPECT_EQ(call.scellBand(), 48U);
  EXPECT_EQ(call.csTxPwrsCount(), 0U);
}

TEST(GsmCall, IsOverWhenTheChannelIsReleased) {
  Heart heart;
  heart.take(0x512F, radioMessage(RadioChannel::slow, test::measurementReport(37, 2)));
  EXPECT_TRUE(heart.knows(metric::kGsmCallMeasurement));
  heart.take(0x512F, type3());
  EXPECT_FALSE(heart.knows(metric::kGsmCallMeasurement));
}

TEST(GsmIdleLevel, ComesOfTheServingCellsLevel) {
  Heart heart;
  heart.take(0x5134, ownCell());
  EXPECT_THAT(heart.take(0x507A, BodyWriter().u16(sixteenths(-71.25)).u8(0)),
              ElementsAre(metric::kGsmIdleMeasurement));
  const auto level = heart.report<KCellularGsmIdleScellMeasurement>(metric::kGsmIdleMeasurement);
  EXPECT_EQ(level.idleRxlevDBm(), -71);
  EXPECT_EQ(level.scellArfcn(), 62U);
  heart.timeMs += 10'001;
  heart.take(0x507A, {});
  EXPECT_FALSE(heart.knows(metric::kGsmIdleMeasurement));
}

Bytes bursts(std::size_t stride, std::uint32_t apart = 1, double dbm = -80) {
  BodyWriter out;
  for (std::uint32_t i = 0; i < 4; ++i) {
    out.u32((2715646 + i * apart) % 2715648).u16(kBand900 | 62).u32(12345).u16(sixteenths(dbm - i));
    out.zeros(stride - 12);
  }
  return out;
}

TEST(GsmIdleLevel, ComesOfBurstsAsTheirMean) {
  for (const std::size_t stride : {12U, 33U, 37U}) {
    Heart heart;
    heart.take(0x506C, BodyWriter().u8(1).bytes(bursts(stride)));
    const auto level = heart.report<KCellularGsmIdleScellMeasurement>(metric::kGsmIdleMeasurement);
    EXPECT_EQ(level.idleRxlevDBm(), -82) << stride;  // -81.5
    EXPECT_EQ(level.scellArfcn(), 62U);
  }
  Heart heart;
  heart.take(0x506A, BodyWriter().u8(4).u8(1).bytes(bursts(37)));
  EXPECT_TRUE(heart.knows(metric::kGsmIdleMeasurement));
  heart.take(0x506A, BodyWriter().u8(5).u8(1).bytes(bursts(37)));
  EXPECT_EQ(heart.counts().unknownVersion, 1U);
}

TEST(GsmIdleLevel, IsNotMadeOfBurstsThatAreNone) {
  Heart heart;
  heart.take(0x506C, BodyWriter().u8(1).bytes(bursts(33, 1000)));
  heart.take(0x506C, BodyWriter().u8(1).bytes(bursts(33, 1, 30)));
  heart.take(0x506C, BodyWriter().u8(1).bytes(bursts(33)).u8(0));
  EXPECT_FALSE(heart.knows(metric::kGsmIdleMeasurement));
  EXPECT_EQ(heart.counts().damaged, 3U);
}

TEST(GsmIdleLevel, HasNoValueDuringACall) {
  Heart heart;
  heart.take(0x512F, radioMessage(RadioChannel::slow, test::measurementReport(37, 2)));
  EXPECT_THAT(heart.take(0x507A, BodyWriter().u16(sixteenths(-71)).u8(0)), IsEmpty());
}

TEST(GsmNeighbours, ComeWithTheirColour) {
  Heart heart;
  BodyWriter log;
  log.u8(3);
  log.u16(kBand900 | 5).u16(sixteenths(-65)).u8(1).u8(0x2B).u32(7).u16(8);
  log.u16(kBand900 | 9).u16(sixteenths(-101.5)).u8(0).u8(0).u32(0).u16(0);
  log.u16(kBand900 | 11).u16(sixteenths(200)).u8(0).u8(0).u32(0).u16(0);
  EXPECT_THAT(heart.take(0x5071, log), ElementsAre(metric::kGsmNeighbours));
  const auto report = heart.report<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
  ASSERT_EQ(report.gsmNcellMeas().size(), 2U);
  EXPECT_EQ(report.gsmNcellMeas()[0]->arfcn(), 5U);
  EXPECT_EQ(report.gsmNcellMeas()[0]->bsic(), 0x2BU);
  EXPECT_EQ(report.gsmNcellMeas()[0]->rxlev(), 45U);
  EXPECT_EQ(report.gsmNcellMeas()[1]->arfcn(), 9U);
  EXPECT_FALSE(report.gsmNcellMeas()[1]->hasBsic());
  EXPECT_EQ(report.gsmNcellMeas()[1]->rxlev(), 9U);
  EXPECT_THAT(report.umtsNcellMeas(), IsEmpty());
}

TEST(GsmNeighbours, KeepTheirColourWhenOnlyLevelsCome) {
  Heart heart;
  heart.take(0x5134, ownCell());
  heart.take(0x5071,
             BodyWriter().u8(1).u16(kBand900 | 5).u16(sixteenths(-65)).u8(1).u8(0x2B).zeros(6));
  heart.take(0x507B, BodyWriter()
                         .u8(2)
                         .u16(kBand900 | 5)
                         .u16(sixteenths(-70))
                         .u16(kBand900 | 62)
                         .u16(sixteenths(-50)));
  const auto report = heart.report<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
  ASSERT_EQ(report.gsmNcellMeas().size(), 1U) << "the serving cell is none";
  EXPECT_EQ(report.gsmNcellMeas()[0]->bsic(), 0x2BU);
  EXPECT_EQ(report.gsmNcellMeas()[0]->rxlev(), 40U);
}

TEST(GsmNeighbours, AreGoneWhenNotMeasuredForHalfAMinute) {
  Heart heart;
  heart.take(0x507B, BodyWriter().u8(1).u16(5).u16(sixteenths(-70)));
  heart.timeMs += 29'000;
  heart.take(0x507B, BodyWriter().u8(1).u16(6).u16(sixteenths(-70)));
  EXPECT_EQ(heart.picture().gsm.neighbours->size(), 2U);
  heart.timeMs += 2'000;
  heart.take(0x507B, Bytes{0});
  const auto report = heart.report<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
  ASSERT_EQ(report.gsmNcellMeas().size(), 1U);
  EXPECT_EQ(report.gsmNcellMeas()[0]->arfcn(), 6U);
}

TEST(GsmNeighbours, AreGoneWhenTheClockIsSetBack) {
  Heart heart;
  heart.take(0x507B, BodyWriter().u8(1).u16(5).u16(sixteenths(-70)));
  heart.timeMs -= 31'000;
  heart.take(0x507B, Bytes{0});
  EXPECT_TRUE(heart.picture().gsm.neighbours->empty());
}

TEST(GsmNeighbours, AreSixtyFourAtMost) {
  Heart heart;
  for (std::uint32_t arfcn = 1; arfcn <= 100; ++arfcn) {
    ++heart.timeMs;
    heart.take(0x507B, BodyWriter().u8(1).u16(arfcn).u16(sixteenths(-70)));
  }
  ASSERT_EQ(heart.picture().gsm.neighbours->size(), 64U);
  EXPECT_EQ(heart.picture().gsm.neighbours->front().arfcn, 37U);
}

Bytes reselection(std::size_t headBytes) {
  BodyWriter out;
  out.u16(kBand900 | 62).u16(0xFFFF).u8(0).u8(40).zeros(headBytes - 7).u8(2);
  out.u16(kBand900 | 7).u16(0xFFFF).u8(0).u8(25).zeros(19);
  out.u16(kBand900 | 8).u16(0xFFFF).u8(0).u8(0).zeros(19);
  return out;
}

TEST(GsmReselection, TellsServingCellAndNeighboursBehindEitherHead) {
  for (const std::size_t headBytes : {26U, 28U}) {
    Heart heart;
    EXPECT_THAT(heart.take(0x51FC, reselection(headBytes)),
                ElementsAre(metric::kGsmIdleMeasurement, metric::kGsmNeighbours));
    const auto level = heart.report<KCellularGsmIdleScellMeasurement>(metric::kGsmIdleMeasurement);
    EXPECT_NEAR(level.idleRxlevDBm(), -70.5, 0.6);
    EXPECT_EQ(level.scellArfcn(), 62U);
    const auto report = heart.report<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
    ASSERT_EQ(report.gsmNcellMeas().size(), 2U);
    EXPECT_EQ(report.gsmNcellMeas()[0]->rxlev(), 25U);
    EXPECT_EQ(report.gsmNcellMeas()[1]->rxlev(), 0U);
  }
  Heart heart;
  heart.take(0x51FC, reselection(27));
  EXPECT_EQ(heart.counts().damaged, 1U);
}

TEST(GsmReselection, HasNoLevelsThatAreNone) {
  constexpr std::size_t kHeadBytes = 26;
  Bytes body = reselection(kHeadBytes);
  body[kHeadBytes + 5] = 64;
  Heart heart;
  heart.take(0x51FC, body);
  const auto report = heart.report<KCellularGsmGrrEventMeasCr>(metric::kGsmNeighbours);
  ASSERT_EQ(report.gsmNcellMeas().size(), 1U);
  EXPECT_EQ(report.gsmNcellMeas()[0]->arfcn(), 8U);
  body[5] = 64;
  EXPECT_THAT(heart.take(0x51FC, body), IsEmpty());
  EXPECT_EQ(heart.counts().damaged, 1U);
}

TEST(GsmReselection, TellsItsParameters) {
  Heart heart;
  heart.take(0x5130, Bytes{4, 7, 9, 0, 0, 1, 0, 1, 1, 20, 10, 3});
  const auto config = heart.report<KCellularGsmIdleConfig>(metric::kGsmIdleConfig);
  EXPECT_EQ(config.msTxpwr(), 7U);
  EXPECT_EQ(config.rxAccMin(), 9U);
  EXPECT_EQ(config.halfRateSupported(), 1U);
  EXPECT_EQ(config.c2Valid(), 1U);
  EXPECT_EQ(config.cbq(), 1U);
  EXPECT_FALSE(config.hasPenaltyT());
  heart.take(0x5130, Bytes{4, 32, 9, 0, 0, 1, 0, 1, 1, 20, 10, 3});
  EXPECT_EQ(heart.counts().damaged, 1U);
}

TEST(GsmTwins, AreReadBehindTheirSubscription) {
  Heart heart;
  const auto behind = [](std::uint8_t subscription, const Bytes& body) {
    return Bytes(BodyWriter().u8(subscription).bytes(body));
  };
  EXPECT_THAT(heart.take(0x5B34, behind(1, ownCell())), IsEmpty());
  EXPECT_THAT(heart.take(0x5B34, behind(0, ownCell())), ElementsAre(metric::kGsmScellInfo));
  EXPECT_FALSE(heart.take(0x5B2F, behind(0, type3())).empty());
  EXPECT_FALSE(heart.take(0x5BFC, behind(0, reselection(28))).empty());
  EXPECT_FALSE(heart.take(0x5B30, behind(0, Bytes{4, 7, 9, 0, 0, 1, 0, 1, 1, 20, 10, 3})).empty());
  EXPECT_FALSE(heart.take(0x5A7A, behind(0, Bytes{0, 0xFC, 0})).empty());
  EXPECT_FALSE(heart.take(0x5A7B, behind(0, Bytes{0})).empty());
  EXPECT_FALSE(heart.take(0x5A71, behind(0, Bytes{0})).empty());
  EXPECT_FALSE(heart.take(0x5A6C, behind(0, BodyWriter().u8(1).bytes(bursts(33)))).empty());
  EXPECT_FALSE(heart.take(0x5A6A, behind(0, BodyWriter().u8(4).u8(1).bytes(bursts(37)))).empty());
  // Behind the wrapper the radio is known already.
  EXPECT_FALSE(heart.take(0x5B34, behind(1, ownCell()), 1).empty());
}

TEST(GsmLogs, StandEveryDamage) {
  const std::vector<std::uint32_t> metrics = {metric::kGsmScellInfo, metric::kGsmIdleConfig,
                                              metric::kGsmIdleMeasurement,
                                              metric::kGsmCallMeasurement, metric::kGsmNeighbours};
  test::mistreat(0x5134, ownCell(), metrics);
  test::mistreat(0x51FC, reselection(28), metrics);
  test::mistreat(0x506C, BodyWriter().u8(1).bytes(bursts(33)), metrics);
  test::mistreat(0x506A, BodyWriter().u8(4).u8(1).bytes(bursts(37)), metrics);
  test::mistreat(0x5071, BodyWriter().u8(1).u16(5).u16(sixteenths(-65)).zeros(8), metrics);
  test::mistreat(0x507B, BodyWriter().u8(1).u16(5).u16(sixteenths(-65)), metrics);
  test::mistreat(0x512F, radioMessage(RadioChannel::slow, test::measurementReport(37, 2)), metrics);
  test::mistreat(0x5B2F, BodyWriter().u8(0).bytes(type3()), metrics);
}

}  // namespace
}  // namespace qel::diagnostics
