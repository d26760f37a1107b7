// The carriers beside the primary one, as reports.

#include <gtest/gtest.h>

#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"
#include "sources/diagnostics/lte/CellReports.h"
#include "sources/diagnostics/lte/LteTables.h"
#include "sources/diagnostics/lte/SignalLogs.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using test::heard;

constexpr std::uint32_t kCarriers = 54035;
constexpr std::uint32_t kComponents = 54027;

SecondaryCarrier carrier(std::uint32_t index, std::uint32_t pci, std::uint32_t earfcn) {
  SecondaryCarrier carrier;
  carrier.index = index;
  carrier.pci = pci;
  carrier.earfcn = earfcn;
  carrier.bandwidth = 5;
  return carrier;
}

Picture withTwoCarriers() {
  Picture picture;
  picture.lte.camp({5780, 185});
  picture.lte.serving = LteServingCell{};
  picture.lte.serving->name = {5780, 185};
  picture.lte.serving->dlBandwidth = 3;
  picture.lte.carriers = {carrier(1, 182, 1975), carrier(2, 9, 66961)};
  picture.lte.carriers[0].band = 4;
  picture.lte.carriers[1].hasUplink = true;
  picture.lte.carriers[1].ulEarfcn = 132497;
  picture.lte.carriers[1].ulBand = 66;
  picture.lte.carriers[1].ulBandwidth = 2;
  return picture;
}

void measureFirst(Picture& picture, std::uint64_t timeMs) {
  const Bytes body = test::lteMeasurement(
      22, 1975, {{182, {heard(-95.5, -67.25, 100, 3.2), heard(-97, -69, 100, 12.3)}, 1}});
  Told told;
  readLteMeasurement({0xB193, timeMs, 0, body}, picture, told);
}

std::string said(std::uint32_t metric, const Picture& picture) {
  const auto payload = findReport(metric)->build(picture, 5);
  if (!payload) return {};
  auto dictionary = findMetricMessage(metric)->describe(*payload);
  dictionary->remove("timestamp");
  return jsonText(*dictionary);
}

TEST(LteCarrierReport, areToldAsTheNetworkConfiguredThem) {
  EXPECT_EQ(said(kCarriers, withTwoCarriers()),
            R"({"scc_list": [{"index": 1, "state": "SCC_STATE_CONFIGURED_DEACTIVATED", )"
            R"("pci": 182, "dl_earfcn": 1975, )"
            R"("dl_rf_band": 4, "dl_bandwidth": 5, "has_uplink": false}, )"
            R"({"index": 2, "state": "SCC_STATE_CONFIGURED_DEACTIVATED", "pci": 9, )"
            R"("dl_earfcn": 66961, "dl_bandwidth": 5, )"
            R"("has_uplink": true, "ul_earfcn": 132497, "ul_rf_band": 66, "ul_bandwidth": 2}]})");
}

// Of each quantity the better antenna's, in hundredths.
TEST(LteCarrierReport, areInUseWithLevelsOnceTheyWereMeasured) {
  Picture picture = withTwoCarriers();
  measureFirst(picture, 1000);
  const std::string text = said(kCarriers, picture);
  EXPECT_EQ(text.rfind(R"({"scc_list": [{"index": 1, "state": "SCC_STATE_ACTIVATED", "pci": 182, )"
                       R"("dl_earfcn": 1975, )"
                       R"("dl_rf_band": 4, "dl_bandwidth": 5, "has_uplink": false, )"
                       R"("rsrp": -9550, "rsrq": -800, "snr": 1230, "rssi": -6725}, )"
                       R"({"index": 2, "state": "SCC_STATE_CONFIGURED_DEACTIVATED", )",
                       0),
            0U)
      << text;
}

TEST(LteCarrierReport, areNotKnownToBeInUseTenSecondsAfterTheyWereMeasured) {
  Picture picture = withTwoCarriers();
  measureFirst(picture, 1000);
  age(picture.lte, 11'000);
  EXPECT_NE(said(kCarriers, picture), said(kCarriers, withTwoCarriers()));
  age(picture.lte, 11'001);
  EXPECT_EQ(said(kCarriers, picture), said(kCarriers, withTwoCarriers()));
}

TEST(LteCarrierReport, withAnotherCellAreNotTheOnesMeasured) {
  Picture picture = withTwoCarriers();
  picture.lte.carriers[0].pci = 183;
  measureFirst(picture, 1000);
  EXPECT_FALSE(picture.lte.carriers[0].signal);
}

TEST(LteCarrierReport, areToldInShortBesideThePrimaryOne) {
  EXPECT_EQ(said(kComponents, withTwoCarriers()),
            R"({"pcc_earfcn": 5780, "scc0_earfcn": 1975, "scc1_earfcn": 66961, )"
            R"("pcc_bandwidth": 3, "scc0_bandwidth": 5, "scc1_bandwidth": 5})");
}

TEST(LteCarrierReport, thatAreReleasedLeaveThePrimaryOne) {
  Picture picture = withTwoCarriers();
  picture.lte.carriers.clear();
  picture.lte.carriersTold = true;
  EXPECT_EQ(said(kComponents, picture), R"({"pcc_earfcn": 5780, "pcc_bandwidth": 3})");
  EXPECT_EQ(said(kCarriers, picture), "{}");
}

}  // namespace
}  // namespace qel::diagnostics
