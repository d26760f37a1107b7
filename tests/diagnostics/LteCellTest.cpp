// LTE's serving cell, from the logs that name it.

#include <gtest/gtest.h>

#include "sources/Metrics.h"
#include "support/diagnostics/LtePackets.h"
#include "support/diagnostics/OtaPackets.h"

namespace qel::diagnostics {
namespace {

using test::LteModem;
using test::lteServingCell;
using test::WrittenLteServingCell;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kServingCell = 0xB0C2;
constexpr std::uint16_t kBroadcast = 0xB0C1;
constexpr std::uint16_t kFoundCell = 0xB197;
constexpr std::uint16_t kNewCell = 1611;
constexpr std::uint32_t kCellInfo = 16578;

class LteServingCellOfVersion : public ::testing::TestWithParam<unsigned> {};

TEST_P(LteServingCellOfVersion, tellsTheCell) {
  LteModem modem;
  EXPECT_EQ(modem.send(kServingCell, lteServingCell(GetParam())), Metrics{kCellInfo});
  EXPECT_EQ(modem.said(kCellInfo),
            R"({"phy_cell_id": 185, "dl_freq": 5780, "ul_freq": 23780, "dl_bw": 3, "ul_bw": 3, )"
            R"("cell_id": 44336657, "freq_band_ind": 17, "tracking_area_code": 21512, )"
            R"("num_mnc_digits": 3, "sel_plmn_mcc": 310, "sel_plmn_mnc": 410})");
  EXPECT_EQ(modem.reader().picture().technology, Technology::lte);
}

TEST_P(LteServingCellOfVersion, tellsEveryBandwidthAsACode) {
  const unsigned blocks[] = {6, 15, 25, 50, 75, 100};
  for (unsigned code = 0; code < 6; ++code) {
    LteModem modem;
    WrittenLteServingCell cell;
    cell.dlBlocks = blocks[code];
    cell.ulBlocks = 33;  // no bandwidth has as many
    modem.send(kServingCell, lteServingCell(GetParam(), cell));
    EXPECT_EQ(modem.reader().picture().lte.serving->dlBandwidth, code);
    EXPECT_EQ(modem.reader().picture().lte.serving->ulBandwidth, std::nullopt);
  }
}

INSTANTIATE_TEST_SUITE_P(Known, LteServingCellOfVersion, ::testing::Values(2, 3));

TEST(LteServingCell, tellsChannelsBeyond65535) {
  LteModem modem;
  WrittenLteServingCell cell;
  cell.earfcn = 66961;
  cell.ulEarfcn = 132497;
  cell.band = 66;
  modem.send(kServingCell, lteServingCell(3, cell));
  EXPECT_EQ(modem.reader().picture().lte.serving->name.earfcn, 66961U);
  EXPECT_EQ(modem.reader().picture().lte.serving->ulEarfcn, 132497U);
}

TEST(LteServingCell, ofALaterVersionTellsNothing) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kServingCell, lteServingCell(4)).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
  EXPECT_EQ(modem.said(kCellInfo), "");
}

TEST(LteServingCell, thatCannotBeTellsNothing) {
  const auto isRefused = [](auto change) {
    LteModem modem;
    WrittenLteServingCell cell;
    change(cell);
    return modem.send(kServingCell, lteServingCell(3, cell)).empty() && modem.damaged() == 1;
  };
  EXPECT_FALSE(isRefused([](WrittenLteServingCell&) {}));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.pci = 504; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.earfcn = 262144; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.ulEarfcn = 0xFFFFFFFF; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.cellId = 1U << 28; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.band = 0; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.mcc = 1000; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.mncDigits = 4; }));
  EXPECT_TRUE(isRefused([](WrittenLteServingCell& cell) { cell.mncDigits = 2; }));  // 410
}

TEST(LteNewCell, endsWhatWasKnownOfTheOneBefore) {
  LteModem modem;
  modem.send(kServingCell, lteServingCell(3));
  EXPECT_TRUE(modem.sendEvent(kNewCell, test::lteNewCellEvent(5780, 185)).empty());
  EXPECT_NE(modem.said(kCellInfo), "");
  modem.sendEvent(kNewCell, test::lteNewCellEvent(5780, 186));
  EXPECT_EQ(modem.said(kCellInfo), "");
  EXPECT_EQ(modem.reader().picture().lte.camped, (LteCellName{5780, 186}));
}

TEST(LteNewCell, hasNeitherTheRulesNorTheLevelsOfTheOneBefore) {
  LteModem modem;
  modem.send(kServingCell, lteServingCell(3));
  modem.send(0xB193, test::lteMeasurement(24, 5780, {{185, {test::heard(-108, -82, 50)}}}));
  modem.send(0xB17F, test::lteIdleServing(5, 5780, {185, -99, -9.5}));
  modem.send(0xB0C0, test::overTheAir(test::AirChannel::bcchDlSch, test::sib1Message({}),
                                      {.earfcn = 5780, .pci = 185}));
  const auto knows = [&] {
    return std::vector{!modem.said(metric::kLteSelRes).empty(),
                       !modem.said(metric::kLteServingMeasurement).empty()};
  };
  EXPECT_EQ(knows(), (std::vector{true, true}));
  modem.sendEvent(kNewCell, test::lteNewCellEvent(5780, 186));
  EXPECT_EQ(knows(), (std::vector{false, false}));
}

TEST(LteNewCell, ofAnotherLengthIsDamaged) {
  LteModem modem;
  Bytes payload = test::lteNewCellEvent(5780, 185);
  payload.push_back(0);
  modem.sendEvent(kNewCell, payload);
  EXPECT_EQ(modem.damaged(), 1U);
  EXPECT_EQ(modem.reader().picture().lte.camped, std::nullopt);
}

// A cell that is heard is not yet the one that serves: nothing is told of it.
void expectBroadcast(std::uint16_t code, const Bytes& body) {
  LteModem modem;
  EXPECT_TRUE(modem.send(code, body).empty());
  EXPECT_EQ(modem.understood(), 1U);
  const auto& broadcast = modem.reader().picture().lte.broadcast;
  ASSERT_TRUE(broadcast);
  EXPECT_EQ(broadcast->name, (LteCellName{2300, 97}));
  EXPECT_EQ(broadcast->dlBandwidth, 5U);
}

TEST(LteBroadcast, isReadInEveryVersion) {
  for (const unsigned version : {1U, 2U, 3U}) {
    SCOPED_TRACE(version);
    expectBroadcast(kBroadcast, test::lteMasterInformation(version));
  }
}

TEST(LteFoundCell, isReadInEveryVersion) {
  for (const unsigned version : {1U, 2U}) {
    SCOPED_TRACE(version);
    expectBroadcast(kFoundCell, test::lteFoundCell(version));
  }
}

TEST(LteBroadcast, ofNarrowbandIsOfAVersionThatIsNotKnown) {
  LteModem modem;
  modem.send(kBroadcast, test::lteMasterInformation(17));
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

}  // namespace
}  // namespace qel::diagnostics
