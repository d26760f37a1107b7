// Where the modem writes a log in a version that is not known, others stand in for it.

#include <gtest/gtest.h>

#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"
#include "sources/diagnostics/lte/CellLogs.h"
#include "sources/diagnostics/lte/CellReports.h"
#include "sources/diagnostics/lte/SignalReports.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using test::heard;
using test::lteConnectedCells;
using test::lteIdleServing;
using test::LteModem;
using test::lteServingCell;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kServingCell = 0xB0C2;
constexpr std::uint16_t kMeasurement = 0xB193;
constexpr std::uint16_t kIdleServing = 0xB17F;
constexpr std::uint16_t kConnectedCells = 0xB179;
constexpr std::uint32_t kCellInfo = 16578;
constexpr std::uint32_t kReceivers = 54017;

const std::vector<test::WrittenLteCell> kHeard = {{185, {heard(-108, -82, 50)}}};
// One antenna alone does not judge a layout.
const Bytes kUnread = test::lteMeasurementCalled(26, 24, 5780, kHeard);

std::string text(std::uint32_t metric, const std::optional<Bytes>& payload) {
  if (!payload) return {};
  auto dictionary = findMetricMessage(metric)->describe(*payload);
  dictionary->remove("timestamp");
  return jsonText(*dictionary);
}

TEST(LteLevel, ofTheIdleCellStandsInForAnUnreadMeasurement) {
  LteModem modem;
  modem.send(kMeasurement, kUnread);
  modem.send(kIdleServing, lteIdleServing(5, 5780, {185, -99, -9.5}));
  EXPECT_EQ(modem.send(kIdleServing, lteIdleServing(5, 5780, {185, -99, -9.5})),
            Metrics{kReceivers});
  EXPECT_EQ(modem.said(kReceivers),
            R"({"rx_info": [{"rssi": -70, "rsrp_range": 41, "rsrq_range": 20}]})");
}

TEST(LteLevel, ofTheConnectedCellStandsInForAnUnreadMeasurement) {
  LteModem modem;
  modem.send(kMeasurement, kUnread);
  modem.send(kConnectedCells, lteConnectedCells(4, 5780, {185, -99, -9.5}, {}));
  EXPECT_EQ(modem.send(kConnectedCells, lteConnectedCells(4, 5780, {185, -99, -9.5}, {})),
            Metrics{kReceivers});
  EXPECT_EQ(modem.said(kReceivers), R"({"rx_info": [{"rsrp_range": 41, "rsrq_range": 20}]})");
  modem.wait(10'001);
  modem.send(0xB0FF, {});
  EXPECT_EQ(modem.said(kReceivers), "");
}

TEST(LteLevel, isNotToldWhereMeasurementsAreRead) {
  LteModem modem;
  modem.send(kMeasurement, test::lteMeasurement(24, 5780, kHeard));
  modem.send(kMeasurement, kUnread);
  EXPECT_TRUE(modem.send(kIdleServing, lteIdleServing(5, 5780, {185, -99, -9.5})).empty());
  EXPECT_TRUE(
      modem.send(kConnectedCells, lteConnectedCells(4, 5780, {185, -99, -9.5}, {})).empty());
}

TEST(LteLevel, isNotToldWhereNoMeasurementCame) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kIdleServing, lteIdleServing(5, 5780, {185, -99, -9.5})).empty());
}

TEST(LteLevel, standsInFromTheSecondOnWhereNoMeasurementComesOrComesAnyMore) {
  LteModem modem;
  const Bytes level = lteIdleServing(5, 5780, {185, -99, -9.5});
  modem.send(kIdleServing, level);
  EXPECT_EQ(modem.send(kIdleServing, level), Metrics{kReceivers});
  modem.send(kMeasurement, test::lteMeasurement(24, 5780, kHeard));
  modem.wait(6'000);
  EXPECT_TRUE(modem.send(kIdleServing, level).empty());
  modem.wait(6'000);
  EXPECT_EQ(modem.send(kIdleServing, level), Metrics{kReceivers});
}

// The picture of a phone on a cell that has said who it is.
Picture onTalkingCell() {
  Picture picture;
  picture.lte.camp({5780, 185});
  picture.lte.broadcast = LteBroadcast{{5780, 185}, 3};
  LteRules rules;
  rules.cell = {5780, 185};
  rules.sib1.emplace();
  rules.sib1->plmns = {{310, 410, 3, false}};
  rules.sib1->trackingAreaCode = 21512;
  rules.sib1->cellIdentity = 44336657;
  rules.sib1->band = 17;
  rules.sib1->tdd = {2, 7};
  rules.sib2.emplace();
  rules.sib2->ulBandwidthBlocks = 25;
  picture.lte.rules = rules;
  return picture;
}

Outcome readServingCell(unsigned version, Picture& picture, Told& told) {
  return readLteServingCell({kServingCell, 5, 0, lteServingCell(version)}, picture, told);
}

TEST(LteBroadcastOfTheServer, standsInForAnUnreadServingCell) {
  Picture picture = onTalkingCell();
  Told told;
  EXPECT_EQ(readServingCell(4, picture, told), Outcome::unknownVersion);
  EXPECT_EQ(Metrics(told.begin(), told.end()), Metrics{kCellInfo});
  EXPECT_EQ(text(kCellInfo, lteCell(picture, 5)),
            R"({"phy_cell_id": 185, "dl_freq": 5780, "dl_bw": 3, "ul_bw": 2, )"
            R"("cell_id": 44336657, "freq_band_ind": 17, "tracking_area_code": 21512, )"
            R"("num_mnc_digits": 3, "sel_plmn_mcc": 310, "sel_plmn_mnc": 410, )"
            R"("tdd_sf_assignment": 2, "tdd_ssf_patterns": 7})");
}

TEST(LteBroadcastOfTheServer, doesNotSayWhichOfTwoNetworksWasSelected) {
  Picture picture = onTalkingCell();
  picture.lte.rules->sib1->plmns.push_back({310, 260, 3, false});
  Told told;
  readServingCell(4, picture, told);
  EXPECT_EQ(text(kCellInfo, lteCell(picture, 5)).find("plmn"), std::string::npos);
}

TEST(LteBroadcastOfTheServer, ofAnotherCellDoesNotStandIn) {
  Picture picture = onTalkingCell();
  picture.lte.camp({5780, 186});
  Told told;
  readServingCell(4, picture, told);
  EXPECT_TRUE(told.empty());
  EXPECT_EQ(lteCell(picture, 5), std::nullopt);
}

TEST(LteBroadcastOfTheServer, doesNotStandInWhereTheServingCellWasReadBefore) {
  Picture picture = onTalkingCell();
  Told told;
  readServingCell(3, picture, told);
  picture.lte.camp({1, 1});
  picture.lte.camp({5780, 185});
  told.clear();
  readServingCell(4, picture, told);
  EXPECT_TRUE(told.empty());
  EXPECT_EQ(lteCell(picture, 5), std::nullopt);
}

TEST(LteServingCell, saysHowItSharesTheFrequencyWhenTheCellDoes) {
  Picture picture = onTalkingCell();
  Told told;
  readServingCell(3, picture, told);
  const std::string said = text(kCellInfo, lteCell(picture, 5));
  EXPECT_NE(said.find(R"("tdd_sf_assignment": 2, "tdd_ssf_patterns": 7)"), std::string::npos)
      << said;
}

TEST(LteMeasurement, saysWhetherThePhoneIsConnected) {
  Picture picture;
  picture.lte.level = LteLevel{-100, -10, std::nullopt, 5};
  const auto mode = [&](std::optional<std::int32_t> state) {
    picture.lte.connection.rrc.state = state;
    const std::string said = text(kReceivers, lteMeasurement(picture, 5));
    return said.substr(0, said.find(R"("rx_info")"));
  };
  EXPECT_EQ(mode(std::nullopt), "{");
  for (const int state : {0, 1, 2}) EXPECT_EQ(mode(state), R"({"is_connected_mode": false, )");
  for (const int state : {3, 4}) EXPECT_EQ(mode(state), R"({"is_connected_mode": true, )");
  for (const int state : {5, 6}) EXPECT_EQ(mode(state), "{");
}

}  // namespace
}  // namespace qel::diagnostics
