// LTE's neighbours, from every log that lists them.

#include <gtest/gtest.h>

#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using test::deaf;
using test::heard;
using test::lteConnectedCells;
using test::lteConnectedNeighbours;
using test::lteIdleIntra;
using test::lteIdleNeighbours;
using test::LteModem;
using test::WrittenLteCell;
using test::WrittenLteLevel;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kIdle = 0xB192;
constexpr std::uint16_t kConnected = 0xB195;
constexpr std::uint16_t kConnectedCells = 0xB179;
constexpr std::uint16_t kIdleServing = 0xB17F;
constexpr std::uint16_t kIdleIntra = 0xB180;
constexpr std::uint32_t kNeighbours = 54031;

const std::vector<WrittenLteCell> kTwo = {{173, {heard(-116.5, -90, 8), heard(-113, -88, 8)}},
                                          {503, {heard(-121, -96, 8), deaf()}}};
constexpr const char* kTwoSaid =
    R"({"meas_nbr_eutra": [{"nbr_earfcn": 5780, "nbr_phys_cell_id": 173, "freq_band_ind": 17, )"
    R"("nbr_rsrp": 27, "nbr_rsrq": 7}, {"nbr_earfcn": 5780, "nbr_phys_cell_id": 503, )"
    R"("freq_band_ind": 17, "nbr_rsrp": 19, "nbr_rsrq": 7}]})";

class LteListedOfVersion : public ::testing::TestWithParam<unsigned> {};

TEST_P(LteListedOfVersion, areToldWhenIdle) {
  LteModem modem;
  EXPECT_EQ(modem.send(kIdle, lteIdleNeighbours(GetParam(), 5780, kTwo)), Metrics{kNeighbours});
  EXPECT_EQ(modem.said(kNeighbours), kTwoSaid);
}

TEST_P(LteListedOfVersion, areToldWhenConnected) {
  LteModem modem;
  EXPECT_EQ(modem.send(kConnected, lteConnectedNeighbours(GetParam(), 5780, kTwo)),
            Metrics{kNeighbours});
  EXPECT_EQ(modem.said(kNeighbours), kTwoSaid);
}

TEST_P(LteListedOfVersion, areLeftOutOneByOneWhenTheirLevelsDisagree) {
  std::vector<WrittenLteCell> cells = kTwo;
  cells[0].antennas[0].rssiDbm += 1;
  LteModem modem;
  modem.send(kConnected, lteConnectedNeighbours(GetParam(), 5780, cells));
  const auto& known = modem.reader().picture().lte.neighbours.cells();
  ASSERT_EQ(known.size(), 1U);
  EXPECT_EQ(known[0].cell.pci, 503U);
}

TEST_P(LteListedOfVersion, areNotToldWhenNoneOfThemCanBe) {
  std::vector<WrittenLteCell> cells = kTwo;
  cells[0].pci = 600;
  cells[1].antennas[0].rsrqDb += 2;
  LteModem modem;
  EXPECT_TRUE(modem.send(kIdle, lteIdleNeighbours(GetParam(), 5780, cells)).empty());
  EXPECT_EQ(modem.damaged(), 1U);
}

TEST_P(LteListedOfVersion, mayBeNone) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kIdle, lteIdleNeighbours(GetParam(), 5780, {})).empty());
  EXPECT_EQ(modem.understood(), 1U);
}

INSTANTIATE_TEST_SUITE_P(Known, LteListedOfVersion, ::testing::ValuesIn(test::kLteListedVersions));

TEST(LteListed, ofAnUnknownVersionAreReadOnlyWhenEveryCellStandsOut) {
  const std::vector<WrittenLteCell> cells = {{173, {heard(-116.5, -90, 8), heard(-113, -88, 8)}},
                                             {210, {heard(-119, -92, 8), heard(-118, -91, 8)}}};
  Bytes body = lteConnectedNeighbours(40, 5780, cells);
  constexpr std::size_t kVersionOfResult = 4 + 12 + 1;
  body[kVersionOfResult] = 56;
  LteModem modem;
  EXPECT_EQ(modem.send(kConnected, body), Metrics{kNeighbours});
  EXPECT_EQ(modem.reader().picture().lte.neighbours.cells().size(), 2U);

  Bytes doubtful = lteConnectedNeighbours(40, 5780, kTwo);
  doubtful[kVersionOfResult] = 56;
  LteModem other;
  EXPECT_TRUE(other.send(kConnected, doubtful).empty());
  EXPECT_EQ(other.ofUnknownVersion(), 1U);
}

class LteConnectedCellsOfVersion : public ::testing::TestWithParam<unsigned> {};

TEST_P(LteConnectedCellsOfVersion, tellTheNeighboursAndWhereThePhoneIs) {
  LteModem modem;
  EXPECT_EQ(modem.send(kConnectedCells, lteConnectedCells(GetParam(), 5780, {185, -108, -8},
                                                          {{173, -113, -16}, {503, -121, -16}}, 2)),
            Metrics{kNeighbours});
  EXPECT_EQ(modem.said(kNeighbours), kTwoSaid);
  EXPECT_EQ(modem.reader().picture().lte.camped, (LteCellName{5780, 185}));
}

TEST_P(LteConnectedCellsOfVersion, withoutNeighboursTellNothing) {
  LteModem modem;
  EXPECT_TRUE(
      modem.send(kConnectedCells, lteConnectedCells(GetParam(), 5780, {185, -108, -8}, {}, 1))
          .empty());
  EXPECT_EQ(modem.understood(), 1U);
}

TEST_P(LteConnectedCellsOfVersion, ofASecondaryCarrierDoNotSayWhereThePhoneIs) {
  LteModem modem;
  modem.send(kConnectedCells,
             lteConnectedCells(GetParam(), 1975, {98, -90, -8}, {{99, -101, -12}}, 0, 1));
  EXPECT_EQ(modem.reader().picture().lte.camped, std::nullopt);
  EXPECT_EQ(modem.reader().picture().lte.neighbours.cells().size(), 1U);
}

TEST_P(LteConnectedCellsOfVersion, withOneThatCannotBeTellNothing) {
  for (const WrittenLteLevel& wrong :
       {WrittenLteLevel{504, -110, -12}, {1, -170, -12}, {1, -5, -12}, {1, -110, 6}}) {
    LteModem modem;
    EXPECT_TRUE(modem
                    .send(kConnectedCells, lteConnectedCells(GetParam(), 5780, {185, -108, -8},
                                                             {{173, -113, -16}, wrong}))
                    .empty());
    EXPECT_EQ(modem.damaged(), 1U);
    EXPECT_EQ(modem.reader().picture().lte.camped, std::nullopt);
  }
}

TEST_P(LteConnectedCellsOfVersion, leaveOutAnUnheardOne) {
  LteModem modem;
  modem.send(kConnectedCells, lteConnectedCells(GetParam(), 5780, {185, -108, -8},
                                                {{1, -180, -30}, {173, -113, -16}}));
  EXPECT_EQ(modem.reader().picture().lte.neighbours.cells().size(), 1U);
}

INSTANTIATE_TEST_SUITE_P(Known, LteConnectedCellsOfVersion, ::testing::Values(3, 4));

class LteIdleOfVersion : public ::testing::TestWithParam<unsigned> {};

TEST_P(LteIdleOfVersion, neighboursAreTold) {
  LteModem modem;
  EXPECT_EQ(
      modem.send(kIdleIntra, lteIdleIntra(GetParam(), 5780, {{173, -113, -16}, {503, -121, -16}})),
      Metrics{kNeighbours});
  EXPECT_EQ(modem.said(kNeighbours), kTwoSaid);
}

TEST_P(LteIdleOfVersion, servingCellIsWhereThePhoneIs) {
  LteModem modem;
  EXPECT_TRUE(
      modem.send(kIdleServing, test::lteIdleServing(GetParam(), 5780, {185, -98.9, -9.4})).empty());
  EXPECT_EQ(modem.understood(), 1U);
  EXPECT_EQ(modem.reader().picture().lte.camped, (LteCellName{5780, 185}));
}

INSTANTIATE_TEST_SUITE_P(Known, LteIdleOfVersion, ::testing::Values(4, 5));

TEST(LteNeighbours, ofAllLogsAreOneList) {
  LteModem modem;
  modem.send(kConnected, lteConnectedNeighbours(4, 5780, kTwo));
  modem.send(kConnectedCells,
             lteConnectedCells(4, 5780, {185, -108, -8}, {{173, -110, -11}, {210, -112, -12}}));
  modem.send(kIdle, lteIdleNeighbours(4, 2300, {{173, {heard(-90, -70, 8)}}}));
  EXPECT_EQ(modem.said(kNeighbours),
            R"({"meas_nbr_eutra": [{"nbr_earfcn": 5780, "nbr_phys_cell_id": 173, )"
            R"("freq_band_ind": 17, "nbr_rsrp": 30, "nbr_rsrq": 17}, )"
            R"({"nbr_earfcn": 5780, "nbr_phys_cell_id": 503, "freq_band_ind": 17, )"
            R"("nbr_rsrp": 19, "nbr_rsrq": 7}, )"
            R"({"nbr_earfcn": 5780, "nbr_phys_cell_id": 210, "freq_band_ind": 17, )"
            R"("nbr_rsrp": 28, "nbr_rsrq": 15}, )"
            R"({"nbr_earfcn": 2300, "nbr_phys_cell_id": 173, "freq_band_ind": 4, )"
            R"("nbr_rsrp": 50, "nbr_rsrq": 17}]})");
}

TEST(LteNeighbours, doNotCountTheCellWhereThePhoneIs) {
  LteModem modem;
  modem.send(kConnected, lteConnectedNeighbours(4, 5780, kTwo));
  modem.send(0xB0C2, test::lteServingCell(3, {.pci = 173}));
  const std::string said = modem.said(kNeighbours);
  EXPECT_EQ(said.find("173"), std::string::npos) << said;
  EXPECT_NE(said.find("503"), std::string::npos) << said;
}

TEST(LteNeighbours, countTheCellWhereThePhoneIsToldToGoUntilItIsThere) {
  LteModem modem;
  modem.send(0xB0C2, test::lteServingCell(3));
  modem.sendEvent(1611, test::lteNewCellEvent(5780, 173));
  modem.send(kConnected, lteConnectedNeighbours(4, 5780, kTwo));
  EXPECT_EQ(modem.said(kNeighbours), kTwoSaid);
  modem.send(kIdleServing, test::lteIdleServing(5, 5780, {173, -98.9, -9.4}));
  EXPECT_EQ(modem.said(kNeighbours).find("173"), std::string::npos);
}

TEST(LteNeighbours, areForgottenThirtySecondsAfterTheyWereMeasured) {
  LteModem modem;
  modem.send(kConnected, lteConnectedNeighbours(4, 5780, kTwo));
  modem.wait(20'000);
  modem.send(kConnected, lteConnectedNeighbours(4, 5780, {kTwo[1]}));
  modem.wait(10'001);
  modem.send(0xB0FF, {});
  const auto& known = modem.reader().picture().lte.neighbours.cells();
  ASSERT_EQ(known.size(), 1U);
  EXPECT_EQ(known[0].cell.pci, 503U);
  modem.wait(30'001);
  modem.send(0xB0FF, {});
  EXPECT_EQ(modem.said(kNeighbours), "");
}

TEST(LteNeighbours, theOldestMakesRoom) {
  LteModem modem;
  for (unsigned i = 0; i <= LteNeighbours::kMost; ++i) {
    modem.wait(1);
    modem.send(kConnected, lteConnectedNeighbours(4, 5780, {{i, {heard(-100, -80, 8)}}}));
  }
  const auto& known = modem.reader().picture().lte.neighbours.cells();
  ASSERT_EQ(known.size(), LteNeighbours::kMost);
  EXPECT_EQ(known.front().cell.pci, 1U);
  EXPECT_EQ(known.back().cell.pci, LteNeighbours::kMost);
}

}  // namespace
}  // namespace qel::diagnostics
