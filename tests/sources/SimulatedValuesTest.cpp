// Every value of the simulated drive within its range, every channel within its band.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>

#include "base/Rendering.h"
#include "sources/Metrics.h"
#include "sources/support/DriveLog.h"

namespace qel {
namespace {

using namespace sources;
using testing::DriveEvent;
using testing::driveOf;
using testing::entriesOf;
using testing::integerOf;

constexpr std::uint64_t kSeeds[] = {1, 2, 5, 42};

struct Range {
  std::uint32_t metric;
  const char* list;  // none: the message itself
  const char* key;
  std::int64_t low;
  std::int64_t high;
};

constexpr Range kRanges[] = {
    {metric::kLteScellInfo, nullptr, "phy_cell_id", 0, 503},
    {metric::kLteScellInfo, nullptr, "dl_bw", 0, 5},
    {metric::kLteScellInfo, nullptr, "cell_id", 0, (1 << 28) - 1},
    {metric::kLteScellInfo, nullptr, "tracking_area_code", 1, 0xFFFD},
    {metric::kLteScellInfo, nullptr, "num_mnc_digits", 2, 2},
    {metric::kLteScellInfo, nullptr, "sel_plmn_mcc", 1, 1},
    {metric::kLteScellInfo, nullptr, "sel_plmn_mnc", 1, 1},
    {metric::kLteRrcState, nullptr, "prev_state_dur_ms", 0, 600'000},
    {metric::kLteSelRes, nullptr, "QRxLevMin", -140, -44},
    {metric::kLteSelRes, nullptr, "QQualMin", -34, -3},
    {metric::kLteSelRes, nullptr, "Q_hyst", 0, 24},
    {metric::kLteSelRes, nullptr, "S_intra_search_P", 0, 62},
    {metric::kLteSelRes, nullptr, "S_non_intra_search_P", 0, 62},
    {metric::kLteSelRes, nullptr, "Thresh_serving_lowP", 0, 62},
    {metric::kLteSelRes, nullptr, "priority_operating_freq", 0, 7},
    {metric::kLteSelRes, "nbr_eutra", "priority", 0, 7},
    {metric::kLteSelRes, "nbr_eutra", "dl_bw", 0, 5},
    {metric::kLteSelRes, "nbr_eutra", "Thres_X_highP", 0, 62},
    {metric::kLteRsrpRsrqSinr, "inst_values", "phy_cell_id", 0, 503},
    {metric::kLteRsrpRsrqSinr, "inst_values", "rsrp0", -140, -40},
    {metric::kLteRsrpRsrqSinr, "inst_values", "rsrp1", -140, -40},
    {metric::kLteRsrpRsrqSinr, "inst_values", "rsrq0", -30, -3},
    {metric::kLteRsrpRsrqSinr, "inst_values", "rsrq1", -30, -3},
    {metric::kLteRsrpRsrqSinr, "inst_values", "sinr0", -40, 60},
    {metric::kLteRsrpRsrqSinr, "inst_values", "sinr1", -40, 60},
    {metric::kLteRsrpRsrqSinr, nullptr, "num_samples", 1, 5},
    {metric::kLteServingMeasurement, "rx_info", "rssi", -110, -10},
    {metric::kLteServingMeasurement, "rx_info", "rsrp_range", 0, 97},
    {metric::kLteServingMeasurement, "rx_info", "rsrq_range", 0, 34},
    {metric::kLteServingMeasurement, "rx_info", "snr", -20, 30},
    {metric::kLteTxPower, "tx_power_info", "pusch_tx_power", -40, 23},
    {metric::kLteTxPower, "tx_power_info", "pucch_tx_power", -40, 23},
    {metric::kLteTxPower, "tx_power_info", "subframe_index", 0, 9},
    {metric::kLteNeighbours, "meas_nbr_eutra", "nbr_phys_cell_id", 0, 503},
    {metric::kLteNeighbours, "meas_nbr_eutra", "nbr_rsrp", 0, 97},
    {metric::kLteNeighbours, "meas_nbr_eutra", "nbr_rsrq", 0, 34},
    {metric::kLteInterRat, "meas_nbr_utra", "psc", 0, 511},
    {metric::kLteInterRat, "meas_nbr_utra", "rscp", 0, 91},
    {metric::kLteInterRat, "meas_nbr_utra", "ecno", 0, 49},
    {metric::kLteInterRat, "meas_nbr_geran", "bsic", 0, 63},
    {metric::kLteInterRat, "meas_nbr_geran", "rxlev", 0, 63},
    {metric::kLteCarrierAggregation, "scc_list", "index", 1, 2},
    {metric::kLteCarrierAggregation, "scc_list", "pci", 0, 503},
    {metric::kLteCarrierAggregation, "scc_list", "dl_bandwidth", 0, 5},
    {metric::kLteCarrierAggregation, "scc_list", "rsrp", -14000, -4000},
    {metric::kLteCarrierAggregation, "scc_list", "rsrq", -3000, -300},
    {metric::kLteCarrierAggregation, "scc_list", "rssi", -11000, -1000},
    {metric::kUmtsCellInfo, nullptr, "psc", 0, 511},
    {metric::kUmtsCellInfo, nullptr, "lac", 1, 0xFFFD},
    {metric::kUmtsCellInfo, nullptr, "cell_id", 0, (1 << 28) - 1},
    {metric::kUmtsServingMeasurement, "rx_info", "rssi", -105, -10},
    {metric::kUmtsServingMeasurement, "rx_info", "rsrp_range", 0, 91},
    {metric::kUmtsServingMeasurement, "rx_info", "rsrq_range", 0, 49},
    {metric::kUmtsTxPower, "tx_power_info", "pusch_tx_power", -40, 23},
    {metric::kUmtsNeighbours, "meas_utra_result", "psc", 0, 511},
    {metric::kUmtsNeighbours, "meas_utra_result", "rscp", 0, 91},
    {metric::kUmtsNeighbours, "meas_utra_result", "ecno", 0, 49},
    {metric::kUmtsNeighbours, "meas_gsm_result", "rxlev", 0, 63},
    {metric::kUmtsNeighbours, "meas_lte_result", "phy_cell_id", 0, 503},
    {metric::kUmtsNeighbours, "meas_lte_result", "rsrp", 0, 97},
    {metric::kUmtsNeighbours, "meas_lte_result", "rsrq", 0, 34},
    {metric::kGsmScellInfo, nullptr, "bsic", 0, 63},
    {metric::kGsmScellInfo, nullptr, "cell_id", 0, 0xFFFF},
    {metric::kGsmIdleConfig, nullptr, "rx_acc_min", 0, 63},
    {metric::kGsmIdleConfig, nullptr, "bs_pa_mfrms", 2, 9},
    {metric::kGsmIdleConfig, nullptr, "radio_link_timeout", 4, 64},
    {metric::kGsmIdleMeasurement, nullptr, "idle_rxlev_dBm", -110, -20},
    {metric::kGsmCallMeasurement, nullptr, "cs_rxlev_sub", 0, 63},
    {metric::kGsmCallMeasurement, nullptr, "cs_rxqual_sub", 0, 7},
    {metric::kGsmGprsConfig, nullptr, "rac", 0, 255},
    {metric::kGsmNeighbours, "gsm_ncell_meas", "bsic", 0, 63},
    {metric::kGsmNeighbours, "gsm_ncell_meas", "rxlev", 0, 63},
    {metric::kGsmNeighbours, "umts_ncell_meas", "cpich_sc", 0, 511},
    {metric::kGsmNeighbours, "umts_ncell_meas", "cpich_rscp", 0, 91},
    {metric::kGsmNeighbours, "umts_ncell_meas", "cpich_ecn0", 0, 49},
    {metric::kGsmNeighbours, "lte_ncell_meas", "physical_cell_id", 0, 503},
    {metric::kGsmNeighbours, "lte_ncell_meas", "bandwidth", 0, 5},
    {metric::kGsmNeighbours, "lte_ncell_meas", "rsrp", 0, 97},
    {metric::kGsmNeighbours, "lte_ncell_meas", "rsrq", 0, 34},
    {metric::kMmContext, nullptr, "t3212_dur_s", 360, 91800},
    {metric::kBearers, "bearer_contexts", "nsapi", 5, 15},
};

std::vector<Dictionary> recordsOf(const DriveEvent& event, const char* list) {
  return list ? entriesOf(event.message, list) : std::vector{event.message};
}

TEST(SimulatedValues, AreWithinTheirRanges) {
  for (const std::uint64_t seed : kSeeds) {
    for (const Range& range : kRanges) {
      for (const DriveEvent& event : driveOf(seed, range.metric)) {
        for (const Dictionary& record : recordsOf(event, range.list)) {
          const std::int64_t value = integerOf(record, range.key);
          ASSERT_TRUE(range.low <= value && value <= range.high)
              << range.key << " of " << range.metric << " is " << value << " after "
              << event.elapsedMs << " ms, seed " << seed;
        }
      }
    }
  }
}

TEST(SimulatedValues, DoNotStandStill) {
  for (const Range& range : {Range{metric::kLteRsrpRsrqSinr, "inst_values", "rsrp0", 20, 0},
                             Range{metric::kLteRsrpRsrqSinr, "inst_values", "sinr0", 20, 0},
                             Range{metric::kLteTxPower, "tx_power_info", "pusch_tx_power", 20, 0},
                             Range{metric::kUmtsTxPower, "tx_power_info", "pusch_tx_power", 10, 0},
                             Range{metric::kGsmIdleMeasurement, nullptr, "idle_rxlev_dBm", 8, 0}}) {
    std::int64_t least = 1000;
    std::int64_t most = -1000;
    for (const DriveEvent& event : driveOf(1, range.metric)) {
      for (const Dictionary& record : recordsOf(event, range.list)) {
        least = std::min(least, integerOf(record, range.key));
        most = std::max(most, integerOf(record, range.key));
      }
    }
    EXPECT_GE(most - least, range.low) << range.key;
  }
}

// Bands and their downlink channels: 36.101, table 5.7.3-1; 25.101, table 5.1a; 45.005, clause 2.
struct Band {
  std::int64_t band;
  std::int64_t low;
  std::int64_t high;
};

constexpr Band kLteBands[] = {{1, 0, 599}, {3, 1200, 1949}, {7, 2750, 3449}, {20, 6150, 6449}};
constexpr Band kUmtsBands[] = {{1, 10562, 10838}, {8, 2937, 3088}};
constexpr Band kGsmBands[] = {{900, 0, 124}};

bool fits(std::span<const Band> bands, std::int64_t band, std::int64_t channel) {
  return std::ranges::any_of(bands, [&](const Band& row) {
    return row.band == band && row.low <= channel && channel <= row.high;
  });
}

struct BandOfChannel {
  std::uint32_t metric;
  const char* list;
  const char* channel;
  const char* band;
  std::span<const Band> bands;
};

TEST(SimulatedValues, ChannelsFitTheirBands) {
  const BandOfChannel rows[] = {
      {metric::kLteScellInfo, nullptr, "dl_freq", "freq_band_ind", kLteBands},
      {metric::kLteSelRes, "nbr_eutra", "earfcn", "band", kLteBands},
      {metric::kLteNeighbours, "meas_nbr_eutra", "nbr_earfcn", "freq_band_ind", kLteBands},
      {metric::kLteCarrierAggregation, "scc_list", "dl_earfcn", "dl_rf_band", kLteBands},
      {metric::kUmtsNeighbours, "meas_lte_result", "earfcn", "eutra_band", kLteBands},
      {metric::kUmtsNeighbours, "meas_utra_result", "uarfcn", "band", kUmtsBands},
  };
  for (const BandOfChannel& row : rows) {
    for (const DriveEvent& event : driveOf(1, row.metric)) {
      for (const Dictionary& record : recordsOf(event, row.list)) {
        ASSERT_TRUE(fits(row.bands, integerOf(record, row.band), integerOf(record, row.channel)))
            << jsonText(record);
      }
    }
  }
}

TEST(SimulatedValues, ChannelsWithoutABandBesideThemFitSomeBand) {
  const BandOfChannel rows[] = {
      {metric::kLteInterRat, "meas_nbr_utra", "uarfcn", nullptr, kUmtsBands},
      {metric::kLteInterRat, "meas_nbr_geran", "arfcn", nullptr, kGsmBands},
      {metric::kUmtsNeighbours, "meas_gsm_result", "arfcn", nullptr, kGsmBands},
      {metric::kUmtsSelRes, "eutra_prio_info", "earfcn", nullptr, kLteBands},
      {metric::kUmtsSelRes, "utra_prio_info", "uarfcn", nullptr, kUmtsBands},
      {metric::kUmtsSelRes, "gsm_prio_info", "arfcn", nullptr, kGsmBands},
      {metric::kGsmNeighbours, "gsm_ncell_meas", "arfcn", nullptr, kGsmBands},
      {metric::kGsmNeighbours, "umts_ncell_meas", "dl_uarfcn", nullptr, kUmtsBands},
      {metric::kGsmNeighbours, "lte_ncell_meas", "earfcn", nullptr, kLteBands},
      {metric::kGsmScellInfo, nullptr, "arfcn", nullptr, kGsmBands},
  };
  for (const BandOfChannel& row : rows) {
    for (const DriveEvent& event : driveOf(1, row.metric)) {
      for (const Dictionary& record : recordsOf(event, row.list)) {
        const std::int64_t channel = integerOf(record, row.channel);
        ASSERT_TRUE(std::ranges::any_of(
            row.bands,
            [&](const Band& band) { return band.low <= channel && channel <= band.high; }))
            << row.channel << " " << channel;
      }
    }
  }
}

TEST(SimulatedValues, UplinkFollowsDownlink) {
  for (const DriveEvent& event : driveOf(1, metric::kLteScellInfo)) {
    EXPECT_EQ(integerOf(event.message, "ul_freq"), integerOf(event.message, "dl_freq") + 18000);
    EXPECT_EQ(integerOf(event.message, "ul_bw"), integerOf(event.message, "dl_bw"));
  }
}

TEST(SimulatedValues, NamesOfBandsAreThoseOfTheChannels) {
  for (const DriveEvent& event : driveOf(1, metric::kUmtsCellInfo)) {
    const bool low = integerOf(event.message, "dl_uarfcn") < 5000;
    EXPECT_EQ(testing::textOf(event.message, "wcdma_band"),
              low ? "SYS_BAND_WCDMA_VIII_900" : "SYS_BAND_WCDMA_I_IMT_2000");
  }
  for (const DriveEvent& event : driveOf(1, metric::kGsmScellInfo)) {
    EXPECT_EQ(testing::textOf(event.message, "gsm_band"), "SYS_BAND_GSM_EGSM_900");
  }
}

TEST(SimulatedValues, EveryEnumerationHasItsName) {
  for (const DriveEvent& event : testing::drive(1)) {
    ASSERT_EQ(jsonText(event.message).find("(unknown"), std::string::npos)
        << jsonText(event.message);
  }
}

}  // namespace
}  // namespace qel
