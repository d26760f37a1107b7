#include "fleet/LatestNumbers.h"

#include <gtest/gtest.h>
#include <prometheus/metric_family.h>

#include "fleet/OpenMetrics.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr std::uint64_t kNowMs = 5'000'000;
constexpr std::uint32_t kScellInfo = 16578;
constexpr std::uint32_t kServingMeasurement = 54017;
constexpr std::uint32_t kNeighbours = 54031;

RecordedEvent report(std::uint32_t metric, const Bytes& payload, std::uint64_t timeMs) {
  RecordedEvent event{timeMs, RecordedKind::metric, {}};
  event.entries.append(kRecordedMetricKey, std::int64_t{metric} + kMetricEventBase);
  event.entries.append(kRecordedPayloadKey, payload);
  return event;
}

RecordedEvent servingCell(std::uint32_t pci, std::uint64_t timeMs) {
  KCellularLteScellInfo cell;
  cell.setPhyCellId(pci);
  cell.setDlFreq(1300);
  cell.setCellId(17955330);
  cell.setTrackingAreaCode(12101);
  cell.setSelPlmnMcc(1);
  cell.setSelPlmnMnc(1);
  cell.setNumMncDigits(2);
  cell.setDlBw(3);
  return report(kScellInfo, cell.data(), timeMs);
}

RecordedEvent measurement(std::uint32_t index, std::uint64_t timeMs) {
  KCellularLteServingCellMeasurement measured;
  auto receiver = std::make_shared<RxInfo>();
  receiver->setRsrpRange(index);
  measured.addRxInfo(std::move(receiver));
  return report(kServingMeasurement, measured.data(), timeMs);
}

RecordedEvent neighbour(std::uint32_t pci, std::uint64_t timeMs) {
  KCellularLteNbrEutraCellMeas neighbours;
  for (int twice = 0; twice < 2; ++twice) {
    auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(1300);
    cell->setNbrPhysCellId(pci);
    cell->setNbrRsrp(50);
    cell->setNbrRsrq(19);
    neighbours.addMeasNbrEutra(std::move(cell));
  }
  return report(kNeighbours, neighbours.data(), timeMs);
}

RecordedEvent connected(std::uint64_t timeMs) {
  KCellularLteRrcState state;
  state.setState(3);
  state.setPrevStateDurMs(320);
  return report(19972, state.data(), timeMs);
}

class LatestNumbersTest : public ::testing::Test {
 protected:
  std::string textAt(std::uint64_t nowMs) const {
    return "\n" + numberText(board.families(nowMs), NumberText::openMetrics);
  }
  bool has(const std::string& line, std::uint64_t nowMs = kNowMs) const {
    return textAt(nowMs).find("\n" + line + "\n") != std::string::npos;
  }
  bool names(const std::string& words, std::uint64_t nowMs = kNowMs) const {
    return textAt(nowMs).find(words) != std::string::npos;
  }

  NumberBoard board{60s};
  LatestNumbers numbers{board};
};

TEST_F(LatestNumbersTest, nameTheCellAndTheUnit) {
  numbers.take(servingCell(217, kNowMs));
  numbers.take(measurement(50, kNowMs));
  EXPECT_TRUE(has("qelwatch_lte_rsrp_dbm{pci=\"217\",earfcn=\"1300\"} -90")) << textAt(kNowMs);
  EXPECT_TRUE(
      has("qelwatch_serving_cell_info{technology=\"lte\",mcc=\"001\",mnc=\"01\",area=\"12101\","
          "cell=\"17955330\",pci=\"217\",earfcn=\"1300\"} 1"))
      << textAt(kNowMs);
}

TEST_F(LatestNumbersTest, tellNothingMoreOfACellThatIsGone) {
  numbers.take(servingCell(217, kNowMs));
  numbers.take(measurement(50, kNowMs));
  numbers.take(servingCell(218, kNowMs));
  EXPECT_FALSE(names("qelwatch_lte_rsrp_dbm")) << textAt(kNowMs);
  EXPECT_FALSE(names("pci=\"217\""));
  numbers.take(measurement(51, kNowMs + 1));
  EXPECT_TRUE(has("qelwatch_lte_rsrp_dbm{pci=\"218\",earfcn=\"1300\"} -89"));
}

TEST_F(LatestNumbersTest, tellNeighboursWhileReportsNameThem) {
  numbers.take(servingCell(217, kNowMs));
  numbers.take(neighbour(34, kNowMs));
  EXPECT_TRUE(has("qelwatch_lte_neighbour_rsrp_dbm{pci=\"34\",earfcn=\"1300\"} -90"))
      << textAt(kNowMs);
  EXPECT_TRUE(has("qelwatch_lte_neighbour_rsrq_db{pci=\"34\",earfcn=\"1300\"} -10"));
  numbers.take(neighbour(35, kNowMs + 11'000));
  EXPECT_FALSE(names("pci=\"34\"", kNowMs + 11'000)) << textAt(kNowMs + 11'000);
  EXPECT_TRUE(names("neighbour_rsrp_dbm{pci=\"35\"", kNowMs + 71'000));
  EXPECT_FALSE(names("neighbour_rsrp_dbm", kNowMs + 71'001)) << "stale";
}

TEST_F(LatestNumbersTest, tellEveryFieldThatHasAUnit) {
  numbers.take(servingCell(217, kNowMs));
  numbers.take(connected(kNowMs));
  EXPECT_TRUE(has("qelwatch_lte_rrc_state_prev_state_dur_seconds 0.32")) << textAt(kNowMs);
  EXPECT_TRUE(has("qelwatch_lte_scell_info_dl_bw_hertz 1e+07")) << textAt(kNowMs);
  EXPECT_TRUE(
      names("# HELP qelwatch_lte_rrc_state_prev_state_dur_seconds Time in the state before"));
}

TEST_F(LatestNumbersTest, nameEntriesOfListsByWhatTellsThemApart) {
  KCellularLteCarrierAggregationStatus status;
  for (std::uint32_t index = 1; index <= 2; ++index) {
    auto carrier = std::make_shared<SecondaryComponentCarrier>();
    carrier->setIndex(index);
    carrier->setDlBandwidth(3);
    carrier->setRsrp(-9550 - static_cast<std::int32_t>(index) * 100);
    carrier->setRsrq(-1050);
    status.addSccList(std::move(carrier));
  }
  numbers.take(report(54035, status.data(), kNowMs));
  const std::string begin = "qelwatch_lte_carrier_aggregation_status_";
  EXPECT_TRUE(has(begin + "rsrp_dbm{index=\"1\"} -96")) << textAt(kNowMs);
  EXPECT_TRUE(has(begin + "rsrp_dbm{index=\"2\"} -97"));
  EXPECT_TRUE(has(begin + "rsrq_db{index=\"2\"} -10.5"));
  EXPECT_TRUE(has(begin + "dl_bandwidth_hertz{index=\"1\"} 1e+07"));
}

TEST_F(LatestNumbersTest, countHandoversAndReselections) {
  numbers.take(servingCell(1, kNowMs));
  numbers.take(connected(kNowMs + 1));
  numbers.take(servingCell(2, kNowMs + 2));
  EXPECT_TRUE(has("qelwatch_happenings_total{kind=\"handover\"} 1")) << textAt(kNowMs);
  EXPECT_TRUE(has("qelwatch_happenings_total{kind=\"reselection\"} 0"));
  EXPECT_TRUE(has("qelwatch_happenings_total{kind=\"rrc\"} 1"));
  EXPECT_TRUE(has("qelwatch_reports_total{metric=\"KCellularLteScellInfo\"} 2"));
}

TEST_F(LatestNumbersTest, countWhatNobodyCanDecode) {
  numbers.take(report(kScellInfo, Bytes{0xFF}, kNowMs));
  numbers.take(RecordedEvent{kNowMs, RecordedKind::metric, {}});
  EXPECT_TRUE(has("qelwatch_undecodable_reports_total 2")) << textAt(kNowMs);
  EXPECT_FALSE(names("KCellularLteScellInfo"));
}

TEST_F(LatestNumbersTest, tellNobodysIdentity) {
  constexpr std::uint32_t kSecret = 3'735'928'559;
  KCellularEmmContext context;
  auto guti = std::make_shared<Guti>();
  guti->setMTmsi(kSecret);
  context.setGuti(std::move(guti));
  context.setT3412DurS(3240);
  numbers.take(report(54540, context.data(), kNowMs));
  KCellularMmContext lower;
  lower.setTmsi(kSecret);
  lower.setT3212DurS(360);
  numbers.take(report(54538, lower.data(), kNowMs));
  EXPECT_TRUE(has("qelwatch_emm_context_t3412_dur_seconds 3240")) << textAt(kNowMs);
  EXPECT_TRUE(has("qelwatch_mm_context_t3212_dur_seconds 360"));
  EXPECT_FALSE(names("3735928559") || names("3.735928559e+09") || names("deadbeef"));
}

}  // namespace
}  // namespace qel::fleet
