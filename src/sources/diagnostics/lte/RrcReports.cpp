#include "sources/diagnostics/lte/RrcReports.h"

#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "messages/runtime/PBDataWriter.h"
#include "sources/Filling.h"

namespace qel::diagnostics {

using sources::set;

std::optional<Bytes> lteRrcState(const Picture& picture, std::uint64_t timeMs) {
  const LteRrcState& rrc = picture.lte.connection.rrc;
  if (!rrc.state) return std::nullopt;
  KCellularLteRrcState report;
  report.setTimestamp(timeMs);
  report.setState(*rrc.state);
  set(report, &KCellularLteRrcState::setPrevState, rrc.previous);
  set(report, &KCellularLteRrcState::setPrevStateDurMs, rrc.previousMs);
  set(report, &KCellularLteRrcState::setCause, rrc.cause);
  return report.data();
}

// There is no schema for it: time and cause, as its relatives begin. The time is the failure's own,
// by which each is told from the one before.
std::optional<Bytes> lteRadioLinkFailure(const Picture& picture, std::uint64_t /*timeMs*/) {
  const auto& failure = picture.lte.connection.failure;
  if (!failure) return std::nullopt;
  PBDataWriter writer;
  PBDataWriterWriteUint64Field(writer, failure->timeMs, 1);
  if (failure->cause) {
    PBDataWriterWriteUint32Field(writer, static_cast<std::uint32_t>(*failure->cause), 2);
  }
  return writer.takeData();
}

std::optional<Bytes> lteReception(const Picture& picture, std::uint64_t timeMs) {
  const LteReception& reception = picture.lte.connection.reception;
  if (!reception.configured) return std::nullopt;
  using Report = KCellularLteCdrxConfig;
  Report report;
  report.setTimestamp(timeMs);
  if (const auto& drx = reception.drx) {
    set(report, &Report::setOnDurationMs, drx->onDurationMs);
    set(report, &Report::setDrxInactivityMs, drx->inactivityMs);
    set(report, &Report::setDrxRetxTimerMs, drx->retransmissionMs);
    set(report, &Report::setLongDrxCycleMs, drx->longCycleMs);
    set(report, &Report::setShortDrxCycleMs, drx->shortCycleMs);
    set(report, &Report::setDrxShortCycleNum, drx->shortCycles);
  }
  set(report, &Report::setRrcState, picture.lte.connection.rrc.state);
  set(report, &Report::setTransmissionMode, reception.transmissionMode);
  return report.data();
}

}  // namespace qel::diagnostics
