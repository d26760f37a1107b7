#include "fleet/KnownDrive.h"

#include <prometheus/metric_family.h>

#include <sstream>

#include "fleet/LatestNumbers.h"
#include "fleet/OpenMetrics.h"
#include "fleet/ServiceCounts.h"
#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/wcdma.h"
#include "metrics/MetricValidator.h"

namespace qel::testing {
namespace {

using V = MetricValidator;

constexpr std::uint64_t kStepS = 15;
constexpr std::uint64_t kSteps = 240;
constexpr std::uint64_t kStepsAMinute = 4;

class Drive {
 public:
  void go(std::uint64_t step) {
    _timeMs = step * kStepS * 1000;
    if (step == 10 * kStepsAMinute) {
      registration(17);
      _board.countDropped();
    }
    if (step < 40 * kStepsAMinute) {
      onLte(step);
    } else if (step < 50 * kStepsAMinute) {
      onUmts();
    } else {
      onGsm();
    }
  }

  // What it told a second later.
  std::string told(std::uint64_t step) const {
    tesk::bus::ServiceStatus service;
    service.sourceRunning = true;
    service.eventsDropped = step;
    service.eventsUndecodable = 2 * step;
    auto families = _board.families(_timeMs + 1000);
    for (auto& family : fleet::serviceFamilies(service)) families.push_back(std::move(family));
    std::istringstream lines(fleet::numberText(families, fleet::NumberText::openMetrics));
    std::string text;
    for (std::string line; std::getline(lines, line);) {
      if (!line.starts_with('#')) text += stamped(line) + "\n";
    }
    return text;
  }

 private:
  std::string stamped(const std::string& line) const {
    const auto space = line.rfind(' ');
    const auto brace = line.find('{');
    const std::string who = std::string("instance=\"") + kDrivenPhone + "\",job=\"qelwatch\"";
    const std::string series =
        brace == std::string::npos
            ? line.substr(0, space) + "{" + who + "}"
            : line.substr(0, brace + 1) + who + "," + line.substr(brace + 1, space - brace - 1);
    const auto timeS = kDriveStartS + static_cast<std::int64_t>(_timeMs / 1000) + 1;
    return series + line.substr(space) + " " + std::to_string(timeS);
  }

  void report(std::int64_t metric, const PBCodable& message) {
    RecordedEvent event{_timeMs, RecordedKind::metric, {}};
    event.entries.append(kRecordedMetricKey, metric);
    event.entries.append(kRecordedPayloadKey, message.data());
    _numbers.take(event);
  }

  void lteCell(std::uint32_t pci) {
    KCellularLteScellInfo cell;
    cell.setPhyCellId(pci);
    cell.setDlFreq(1300);
    cell.setCellId(1000 + pci);
    report(V::K_LTE_SCELL_INFO, cell);
  }
  void rrcState(std::int32_t state) {
    KCellularLteRrcState message;
    message.setState(state);
    report(V::K_LTE_RRC_STATE, message);
  }
  void registration(std::int32_t rejectCause) {
    KCellularEmmContext context;
    context.setRegStatus(11);
    context.setRejectCause(rejectCause);
    report(V::K_LTE_EMM_CTXT, context);
  }
  void received(std::int64_t metric, std::uint32_t level, std::uint32_t quality) {
    KCellularLteServingCellMeasurement measured;
    auto receiver = std::make_shared<RxInfo>();
    receiver->setRsrpRange(level);
    receiver->setRsrqRange(quality);
    receiver->setSnr(12);
    measured.addRxInfo(std::move(receiver));
    report(metric, measured);
  }

  void onLte(std::uint64_t step) {
    if (step == 0) {
      registration(0);
      lteCell(217);
      rrcState(3);
    }
    if (step == 20 * kStepsAMinute) lteCell(218);
    if (step == 30 * kStepsAMinute) {
      rrcState(1);
      lteCell(219);
    }
    received(V::K_LTE_SCELL_MEAS, step < 20 * kStepsAMinute ? 50 : 40, 19);
    KCellularLteNbrEutraCellMeas neighbours;
    for (int pci = 34; pci < 40; ++pci) {
      auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
      cell->setNbrEarfcn(1300);
      cell->setNbrPhysCellId(static_cast<std::uint32_t>(pci));
      cell->setNbrRsrp(84 - pci);
      neighbours.addMeasNbrEutra(std::move(cell));
    }
    report(V::K_LTE_INTRARAT_MEAS, neighbours);
  }
  void onUmts() {
    KCellularWcdmaCellInfo cell;
    cell.setPsc(104);
    cell.setDlUarfcn(10713);
    report(V::K_UMTS_SCELL_INFO, cell);
    KCellularWcdmaScellMeasurement measured;
    auto receiver = std::make_shared<RxInfo>();
    receiver->setRsrpRange(41);
    receiver->setRsrqRange(34);
    measured.addRxInfo(std::move(receiver));
    report(V::K_UMTS_SCELL_MEAS, measured);
  }
  void onGsm() {
    KCellularGsmScellInfo cell;
    cell.setArfcn(12);
    cell.setBsic(16);
    report(V::K_GSM_SCELL_INFO, cell);
    KCellularGsmIdleScellMeasurement measured;
    measured.setIdleRxlevDBm(-62);
    report(V::K_GSM_IDLE_SCELL_MEAS, measured);
  }

  std::uint64_t _timeMs = 0;
  fleet::NumberBoard _board{std::chrono::seconds(60)};
  fleet::LatestNumbers _numbers{_board};
};

}  // namespace

std::string knownDrive() {
  Drive drive;
  std::string text;
  for (std::uint64_t step = 0; step <= kSteps; ++step) {
    drive.go(step);
    text += drive.told(step);
  }
  return text + "# EOF\n";
}

}  // namespace qel::testing
