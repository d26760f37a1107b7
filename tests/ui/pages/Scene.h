// A phone whose reports come when a test says so, and what the pages are made of.
#pragma once

#include <cstdint>
#include <memory>

#include "history/History.h"
#include "history/Viewpoint.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "metrics/Feed.h"

namespace qel::testing {

inline constexpr std::uint64_t kStartMs = 1'800'000'000'000;  // 2027-01-15 08:00:00 UTC

// LteRrcState.
inline constexpr std::int32_t kIdle = 1;
inline constexpr std::int32_t kConnected = 3;

struct LteCellOfTest {
  std::uint32_t pci = 123;
  std::uint32_t earfcn = 1300;
  std::uint32_t eci = (4660U << 8U) + 1;
  std::uint32_t tac = 4711;
};

class Scene {
 public:
  Scene() { validator->setObserver(&history, clock); }
  ~Scene() { validator->setObserver(nullptr); }

  // So long after the start.
  void at(std::uint64_t ms) { clock.timeMs = kStartMs + ms; }

  void cell(const LteCellOfTest& cell) {
    KCellularLteScellInfo info;
    info.setPhyCellId(cell.pci);
    info.setDlFreq(cell.earfcn);
    info.setCellId(cell.eci);
    info.setTrackingAreaCode(cell.tac);
    info.setFreqBandInd(3);
    info.setNumMncDigits(2);
    info.setSelPlmnMcc(262);
    info.setSelPlmnMnc(1);
    validator.feed(MetricValidator::K_LTE_SCELL_INFO, info);
  }

  void rrc(std::int32_t state) {
    KCellularLteRrcState report;
    report.setState(state);
    validator.feed(MetricValidator::K_LTE_RRC_STATE, report);
  }

  void signal(std::int32_t rsrp, std::int32_t rsrq, std::int32_t sinrHalves) {
    auto average = std::make_shared<RsrpRsrqSinr>();
    average->setRsrp0(rsrp);
    average->setRsrq0(rsrq);
    average->setSinr0(sinrHalves);
    KCellularLteRsrpRsrqSinr report;
    report.setAvgValues(average);
    validator.feed(MetricValidator::K_LTE_RSRP_RSRQ_SINR, report);
  }

  // A level every second from that time on, until another.
  void signals(std::uint64_t fromMs, std::uint64_t toMs, std::int32_t rsrp) {
    for (std::uint64_t time = fromMs; time <= toMs; time += 1000) {
      at(time);
      signal(rsrp, -9, 25);
    }
  }

  void neighbour(std::uint32_t pci, std::int32_t rsrpDbm) {
    auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(1300);
    cell->setNbrPhysCellId(pci);
    cell->setNbrRsrp(rsrpDbm + 140);
    cell->setNbrRsrq(14);
    _neighbours.addMeasNbrEutra(cell);
  }
  void reportNeighbours() {
    validator.feed(MetricValidator::K_LTE_INTRARAT_MEAS, _neighbours);
    _neighbours = {};
  }

  Viewpoint viewpoint(bool isLive = true) const {
    return {&history, validator.validator.get(), clock.timeMs, isLive};
  }

  struct SetClock final : Clock {
    std::uint64_t nowMs() const override { return timeMs; }
    std::uint64_t timeMs = kStartMs;
  };

  SetClock clock;
  History history;
  FedValidator validator;

 private:
  KCellularLteNbrEutraCellMeas _neighbours;
};

}  // namespace qel::testing
